#include "Commands/Help.h"

#include "Commands/Argument.h"

#include <CLI/CLI.hpp>
#include <memory>
#include <sstream>

namespace ovrin {

namespace {

constexpr std::size_t kNameWidth = 28;
constexpr std::size_t kLineWidth = 80;

constexpr const char* kExitStatuses =
    "Exit status: 0 done, 1 something is open or was found, 2 could not be done.\n";

/// A paragraph in lines of `width` characters.
std::string Wrapped(const std::string& text, std::size_t width = kLineWidth - kNameWidth) {
    std::istringstream words(text);
    std::string wrapped;
    std::size_t length = 0; // of the last line
    for (std::string word; words >> word; length += word.size()) {
        if (length > 0 && length + 1 + word.size() > width) {
            wrapped += '\n';
            length = 0;
        } else if (length > 0) {
            wrapped += ' ';
            ++length;
        }
        wrapped += word;
    }
    return wrapped;
}

/// What the names of the long options are below each other behind.
constexpr const char* kNoShortName = "    ";

std::string Names(const CLI::Option& option) {
    std::string names;
    for (const std::string& name : option.get_snames()) names += "-" + name + ", ";
    if (names.empty()) names = kNoShortName;
    for (const std::string& name : option.get_lnames()) names += "--" + name + ", ";
    return names.substr(0, names.size() - 2);
}

class Format : public CLI::Formatter {
public:
    Format() {
        column_width(kNameWidth);
        label("OPTIONS", "options");
        label("SUBCOMMAND", "COMMAND ...");
        label("Positionals", "Arguments");
    }

    std::string make_option_name(const CLI::Option* option, bool isPositional) const override {
        return isPositional ? option->get_name(true) : Names(*option);
    }

    std::string make_option_opts(const CLI::Option* option) const override {
        const std::string value = option->nonpositional() ? ValueForm(*option) : "";
        return (value.empty() ? "" : " " + value) + (IsRepeated(*option) ? " ..." : "");
    }

    std::string make_option_desc(const CLI::Option* option) const override {
        return Wrapped(option->get_description());
    }

    std::string make_usage(const CLI::App* app, std::string name) const override {
        return "\n" + CLI::Formatter::make_usage(app, std::move(name));
    }

    std::string make_subcommand(const CLI::App* command) const override {
        std::ostringstream line;
        CLI::detail::format_help(line, command->get_name(), Wrapped(command->get_description()), kNameWidth);
        return line.str();
    }

    std::string make_footer(const CLI::App* app) const override {
        std::istringstream footer(CLI::Formatter::make_footer(app));
        std::string text;
        for (std::string line; std::getline(footer, line);) text += Wrapped(line, kLineWidth) + '\n';
        return (text.empty() ? "" : text + '\n') + kExitStatuses;
    }
};

} // namespace

void FormatHelp(CLI::App& program) {
    program.formatter(std::make_shared<Format>());
    program.set_help_flag("-h,--help", "tell what there is");
}

} // namespace ovrin
