#pragma once

namespace CLI {
class App;
}

namespace ovrin {

/// Lets `program`, and the commands that are added to it from now on, tell what there is in the form of the
/// other texts: values by their words, lines that fit a terminal, and the exit statuses at the end.
void FormatHelp(CLI::App& program);

} // namespace ovrin
