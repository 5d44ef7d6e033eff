#include "Commands/Misuse.h"

#include "Commands/Suggestion.h"

#include <CLI/CLI.hpp>
#include <algorithm>

namespace ovrin {

namespace {

using Words = std::vector<std::string>;

std::string InQuotes(const std::string& text) {
    return "\"" + text + "\"";
}

/// Whether a word is meant as an option: behind -- none is.
bool IsOption(const std::string& word, const Words& arguments) {
    const auto end = std::ranges::find(arguments, "--");
    return word.size() > 1 && word.starts_with('-') &&
           (end == arguments.end() || std::find(arguments.begin(), end, word) != end);
}

/// What nothing was found for, in the order of the arguments.
Words UnexpectedWords(const CLI::App& program, const Words& arguments) {
    Words words = program.remaining(true);
    std::erase(words, "--");
    std::ranges::stable_sort(words, {},
                             [&](const std::string& word) { return std::ranges::find(arguments, word); });
    return words;
}

std::string WithoutCommand(const Words& unexpected, const Words& arguments) {
    if (unexpected.empty()) return "a command is missing";
    return std::string(IsOption(unexpected.front(), arguments) ? "there is no option "
                                                               : "there is no command ") +
           InQuotes(unexpected.front());
}

std::string Unexpected(const Words& unexpected, const Words& arguments) {
    const auto option =
        std::ranges::find_if(unexpected, [&](const std::string& word) { return IsOption(word, arguments); });
    if (option != unexpected.end()) return "there is no option " + InQuotes(*option);
    return InQuotes(unexpected.front()) +
           (unexpected.size() == 1 ? " is an argument" : " and more are arguments") + " too many";
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

std::string Problem(const CLI::App& program, const CLI::ParseError& error, const Words& unexpected,
                    const Words& arguments) {
    if (program.get_subcommands().empty()) return WithoutCommand(unexpected, arguments);
    switch (static_cast<CLI::ExitCodes>(error.get_exit_code())) {
    case CLI::ExitCodes::ExtrasError:
        return Unexpected(unexpected, arguments);
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

std::string DescribeMisuse(const CLI::App& program, const CLI::ParseError& error,
                           const std::vector<std::string>& arguments) {
    const auto parsed = program.get_subcommands();
    const CLI::App& app = parsed.empty() ? program : *parsed.front();
    const std::string name = parsed.empty() ? "ovrin" : "ovrin " + app.get_name();
    const Words unexpected = UnexpectedWords(program, arguments);
    const std::string problem = name + ": " + Problem(program, error, unexpected, arguments) + ".\n";
    if (parsed.empty() && unexpected.empty()) return problem + program.help();
    return problem + Suggestions(app, unexpected) + InQuotes(name + " --help") + " tells what there is.\n";
}

} // namespace ovrin
