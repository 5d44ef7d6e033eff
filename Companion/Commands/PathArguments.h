#pragma once

#include <string>
#include <vector>

namespace CLI {
class App;
}

namespace ovrin {

/// The option by which a command takes paths apart from other operands.
inline constexpr const char* kPathOption = "--path";

/// The arguments with what stands behind "--" as values of kPathOption, if the command that `arguments`
/// begins with has it: otherwise nobody could tell such paths from the operands in front of them.
std::vector<std::string> WithPathOptions(const CLI::App& program, const std::vector<std::string>& arguments);

} // namespace ovrin
