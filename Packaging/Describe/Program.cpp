#include "Describe/Program.h"

std::string OptionWords(const std::vector<DescribedOption>& options, bool withValue) {
    std::vector<std::string> words;
    for (const DescribedOption& option : options)
        if (option.value.empty() != withValue)
            words.insert(words.end(), option.words.begin(), option.words.end());
    return Joined(words, " ");
}

std::string Form(const DescribedOption& option) {
    return option.value.empty() ? option.words.front() : option.words.front() + " " + option.value;
}

std::string Joined(const std::vector<std::string>& words, std::string_view between) {
    std::string text;
    for (const std::string& word : words) (text += text.empty() ? "" : between) += word;
    return text;
}

std::string Escaped(std::string_view text, std::string_view characters, std::string_view replacement) {
    std::string escaped;
    for (const char character : text) {
        if (characters.find(character) == std::string_view::npos) {
            escaped += character;
            continue;
        }
        for (const char part : replacement) escaped += part == '&' ? character : part;
    }
    return escaped;
}
