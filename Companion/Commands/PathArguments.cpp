#include "Commands/PathArguments.h"

#include <CLI/CLI.hpp>
#include <algorithm>

namespace ovrin {

std::vector<std::string> WithPathOptions(const CLI::App& program, const std::vector<std::string>& arguments) {
    const auto mark = std::ranges::find(arguments, "--");
    if (mark == arguments.end() || mark == arguments.begin()) return arguments;
    const auto commands =
        program.get_subcommands([&](const CLI::App* command) { return command->get_name() == arguments[0]; });
    if (commands.empty() || !commands.front()->get_option_no_throw(kPathOption)) return arguments;
    std::vector<std::string> result(arguments.begin(), mark);
    for (auto path = mark + 1; path != arguments.end(); ++path)
        result.push_back(std::string(kPathOption) + "=" + *path);
    return result;
}

} // namespace ovrin
