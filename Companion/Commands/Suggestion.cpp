#include "Commands/Suggestion.h"

#include <CLI/CLI.hpp>
#include <algorithm>

namespace ovrin {

namespace {

/// Letters to change, leave out, put in or swap with their neighbour to make one word the other: the optimal
/// string alignment distance.
std::size_t Distance(const std::string& left, const std::string& right) {
    std::vector<std::size_t> beforeLast(right.size() + 1), last(right.size() + 1), row(right.size() + 1);
    for (std::size_t j = 0; j <= right.size(); ++j) row[j] = j;
    for (std::size_t i = 1; i <= left.size(); ++i) {
        beforeLast = std::exchange(last, row);
        row[0] = i;
        for (std::size_t j = 1; j <= right.size(); ++j) {
            const bool isSame = left[i - 1] == right[j - 1];
            row[j] = std::min({last[j] + 1, row[j - 1] + 1, last[j - 1] + (isSame ? 0 : 1)});
            if (i > 1 && j > 1 && left[i - 1] == right[j - 2] && left[i - 2] == right[j - 1])
                row[j] = std::min(row[j], beforeLast[j - 2] + 1);
        }
    }
    return row[right.size()];
}

std::vector<std::string> KnownWords(const CLI::App& app) {
    std::vector<std::string> words;
    for (const CLI::App* command : app.get_subcommands([](const CLI::App*) { return true; }))
        words.push_back(command->get_name());
    for (const CLI::Option* option : app.get_options())
        for (const std::string& name : option->get_lnames()) words.push_back("--" + name);
    return words;
}

} // namespace

std::string Nearest(const std::string& word, std::span<const std::string> known) {
    std::string nearest;
    std::size_t least = word.size() / 3 + 1; // a third of the letters may be wrong
    for (const std::string& candidate : known) {
        const std::size_t distance = Distance(word, candidate);
        if (distance > least || (distance == least && !nearest.empty())) continue;
        least = distance;
        nearest = candidate;
    }
    return nearest;
}

std::string Suggestions(const CLI::App& app, const std::vector<std::string>& unexpected) {
    const std::vector<std::string> known = KnownWords(app);
    std::string lines;
    for (const std::string& word : unexpected) {
        const std::string nearest = Nearest(word.substr(0, word.find('=')), known);
        if (!nearest.empty()) lines += "Did you mean " + nearest + "?\n";
    }
    return lines;
}

} // namespace ovrin
