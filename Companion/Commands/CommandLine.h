#pragma once

#include "Commands/Outcome.h"

#include <string>
#include <vector>

namespace CLI {
class App;
}

namespace ovrin {

/// Runs the program with these arguments, those behind its name. Whatever goes wrong is told on standard
/// error.
Outcome RunCommandLine(const std::vector<std::string>& arguments);

/// Gives every command of the program to `app`, with its options: for help and for what is made of it, such
/// as completion. What they would do is forgotten.
void DescribeAll(CLI::App& app);

} // namespace ovrin
