#pragma once

#include <string>
#include <vector>

namespace CLI {
class Option;
}

namespace ovrin {

/// The words that the checks of an option allow as its value; empty if they don't name any.
std::vector<std::string> AllowedWords(const CLI::Option& option);

/// What stands for the value of an option in texts for people, such as FILE, N or git|hg|svn; empty for an
/// option that stands alone.
std::string ValueForm(const CLI::Option& option);

/// Whether the option, or the operand, takes several values.
bool IsRepeated(const CLI::Option& option);

} // namespace ovrin
