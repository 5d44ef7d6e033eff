#include "Commands/Misuse.h"

#include "Commands/Suggestion.h"

#include <CLI/CLI.hpp>
#include <algorithm>

namespace ovrin {

namespace {

bool IsOption(const std::string& word) {
    return word.size() > 1 && word.starts_with('-');
}

std::string InQuotes(const std::string& text) {
    return "\"" + text + "\"";
}

std::string WithoutCommand(const std::vector<std::string>& unexpected) {
    if (unexpected.empty()) return "a command is missing";
    return std::string(IsOption(unexpected.front()) ? "there is no option " : "there is no command ") +
           InQuotes(unexpected.front());
}

/// Behind -- nothing is an option.
std::string Unexpected(std::vector<std::string> words) {
    const auto end = std::ranges::find(words, "--");
    const auto option = std::find_if(words.begin(), end, IsOption);
    if (option != end) return "there is no option " + InQuotes(*option);
    std::erase(words, "--");
    return InQuotes(words.front()) + (words.size() == 1 ? " is an argument" : " and more are arguments") +
           " too many";
}

/// "--format: xml not in {text,json}", where the library knows all values.
std::string NotAllowed(const std::string& message) {
    const std::size_t name = message.find(": ");
    const std::size_t set = message.rfind(" not in {");
    if (set == std::string::npos || name > set) return message;
    const std::string words = message.substr(set + 9);
    const auto allowed = CLI::detail::split(words.substr(0, words.find('}')), ',');
    return message.substr(0, name) + " can't be " + InQuotes(message.substr(name + 2, set - name - 2)) +
           ", only " + CLI::detail::join(allowed, ", ");
}

/// "Could not convert: --jobs = x"
std::string NotConverted(const std::string& message) {
    const std::size_t name = message.find(": ");
    const std::size_t value = message.find(" = ");
    if (name == std::string::npos || value == std::string::npos) return message;
    return message.substr(name + 2, value - name - 2) + " can't be " + InQuotes(message.substr(value + 3));
}

/// "--part: 1 required TEXT missing" or "--part: At Most 1 required but received 2"
std::string Mismatch(const std::string& message) {
    const std::string name = message.substr(0, message.find(": "));
    if (message.ends_with(" missing")) return name + " needs a value";
    return message.starts_with(name + ": At Most ") ? name + " is given too often" : message;
}

std::string Problem(const CLI::App& program, const CLI::ParseError& error,
                    const std::vector<std::string>& unexpected) {
    if (program.get_subcommands().empty()) return WithoutCommand(unexpected);
    switch (static_cast<CLI::ExitCodes>(error.get_exit_code())) {
    case CLI::ExitCodes::ExtrasError:
        return Unexpected(unexpected);
    case CLI::ExitCodes::ValidationError:
        return NotAllowed(error.what());
    case CLI::ExitCodes::ConversionError:
        return NotConverted(error.what());
    case CLI::ExitCodes::ArgumentMismatch:
        return Mismatch(error.what());
    default:
        return error.what();
    }
}

} // namespace

std::string DescribeMisuse(const CLI::App& program, const CLI::ParseError& error) {
    const auto parsed = program.get_subcommands();
    const CLI::App& app = parsed.empty() ? program : *parsed.front();
    const std::string name = parsed.empty() ? "ovrin" : "ovrin " + app.get_name();
    const std::vector<std::string> unexpected = program.remaining(true);
    const std::string problem = name + ": " + Problem(program, error, unexpected) + ".\n";
    if (parsed.empty() && unexpected.empty()) return problem + program.help();
    return problem + Suggestions(app, unexpected) + InQuotes(name + " --help") + " tells what there is.\n";
}

} // namespace ovrin
