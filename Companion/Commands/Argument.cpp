#include "Commands/Argument.h"

#include <CLI/CLI.hpp>

namespace ovrin {

/// They stand between the braces of a type name such as TEXT:{git,hg,svn}.
std::vector<std::string> AllowedWords(const CLI::Option& option) {
    const std::string type = option.get_type_name();
    const std::size_t open = type.find('{');
    const std::size_t close = type.find('}', open);
    if (close == std::string::npos) return {};
    return CLI::detail::split(type.substr(open + 1, close - open - 1), ',');
}

std::string ValueForm(const CLI::Option& option) {
    if (option.get_items_expected_max() == 0) return "";
    if (!option.get_option_text().empty()) return option.get_option_text();
    const std::vector<std::string> words = AllowedWords(option);
    if (!words.empty()) return CLI::detail::join(words, "|");
    const std::string type = option.get_type_name();
    return type.starts_with("INT") || type.starts_with("UINT") ? "N" : type.substr(0, type.find(':'));
}

bool IsRepeated(const CLI::Option& option) {
    return option.get_items_expected_max() > 1;
}

} // namespace ovrin
