#include "Writing/ScalarStyle.h"

#include <array>
#include <cstdint>

namespace ovrin_yaml {

namespace {

enum CharacterClass : std::uint8_t {
    kBlank = 1,
    kLineFeed = 2,
    kSpecial = 4,        // can only be written as an escape
    kFlowIndicator = 8,  // has a meaning anywhere in a flow collection
    kColon = 16,         // the same, and ends a key if whitespace follows
    kHash = 32,          // begins a comment behind whitespace
    kLeading = 64,       // has a meaning as first character
    kLeadingSpaced = 128 // has a meaning as first character before whitespace
};

constexpr std::array<std::uint8_t, 256> MakeClasses() {
    std::array<std::uint8_t, 256> classes{};
    for (unsigned c = 0; c < 256; ++c)
        if (c < 0x20 || c > 0x7E) classes[c] = kSpecial;
    const auto add = [&](std::string_view characters, std::uint8_t bits) {
        for (const char c : characters) classes[static_cast<unsigned char>(c)] |= bits;
    };
    add(" ", kBlank);
    classes['\n'] = kLineFeed;
    add(",?[]{}", kFlowIndicator);
    add(":", kColon);
    add("#", kHash);
    add("#,[]{}&*!|>'\"%@`", kLeading);
    add("-?:", kLeadingSpaced);
    return classes;
}

constexpr std::array<std::uint8_t, 256> kClasses = MakeClasses();

std::uint8_t ClassOf(char c) {
    return kClasses[static_cast<unsigned char>(c)];
}

/// Whitespace other than these two is special, which decides before anyone asks.
bool IsSpace(char c) {
    return c == ' ' || c == '\n';
}

bool Contains(std::string_view text, std::string_view part) {
    return text.find(part) != std::string_view::npos;
}

/// The first characters mean something in a block and in a flow collection.
bool BeginsWithIndicator(std::string_view text) {
    const std::uint8_t first = ClassOf(text.front());
    if (first & kLeading) return true;
    if ((first & kLeadingSpaced) && (text.size() == 1 || IsSpace(text[1]))) return true;
    return text.starts_with("---") || text.starts_with("...");
}

ScalarForms ClassifySpecial(std::string_view text) {
    const bool lineBreaks = text.find_first_of("\n\r") != std::string_view::npos ||
                            Contains(text, "\xC2\x85") || Contains(text, "\xE2\x80\xA8") ||
                            Contains(text, "\xE2\x80\xA9");
    return {false, false, false, lineBreaks};
}

} // namespace

ScalarForms ClassifyScalar(std::string_view text) {
    if (text.empty()) return {true, false, true, false};

    unsigned seen = 0;
    for (const char c : text) seen |= ClassOf(c);
    if (seen & kSpecial) return ClassifySpecial(text);
    if (seen & kLineFeed) return {false, false, !Contains(text, " \n") && !Contains(text, "\n "), true};

    ScalarForms forms;
    bool indicator = BeginsWithIndicator(text);
    if (seen & kBlank) {
        indicator |= text.front() == ' ' || text.back() == ' ';
        indicator |= (seen & kColon) && Contains(text, ": ");
        indicator |= (seen & kHash) && Contains(text, " #");
    }
    indicator |= text.back() == ':';
    forms.plainInBlock = !indicator;
    forms.plainInFlow = !indicator && !(seen & (kFlowIndicator | kColon));
    return forms;
}

} // namespace ovrin_yaml
