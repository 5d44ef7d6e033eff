#pragma once

#include <span>
#include <string>
#include <vector>

namespace CLI {
class App;
}

namespace ovrin {

/// The one of `known` that was most likely meant by `word`: the first of those that the fewest changed,
/// missing or swapped letters tell from it. Empty if none is near.
std::string Nearest(const std::string& word, std::span<const std::string> known);

/// A line "Did you mean --json?" for each of the arguments that `app` didn't expect and that is near an
/// option or a command of it.
std::string Suggestions(const CLI::App& app, const std::vector<std::string>& unexpected);

} // namespace ovrin
