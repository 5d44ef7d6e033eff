#include "Names/PrintableText.h"

#include <algorithm>
#include <array>
#include <cstdint>

namespace ovrin {

namespace {

struct Character {
    std::size_t length;  ///< bytes
    std::uint32_t point; ///< kNone for a byte that is no part of a character
};
constexpr std::uint32_t kNone = 0xFFFFFFFF;

unsigned Byte(std::string_view text, std::size_t at) {
    return static_cast<unsigned char>(text[at]);
}

/// The character at the beginning of a text that isn't empty. Forms that are longer than need be, surrogates
/// and numbers beyond the last are no characters.
Character FirstCharacter(std::string_view text) {
    static constexpr std::array<std::uint32_t, 5> kLeast = {0, 0, 0x80, 0x800, 0x10000};
    const unsigned first = Byte(text, 0);
    if (first < 0x80) return {1, first};
    const std::size_t length = first >= 0xF0 ? 4 : first >= 0xE0 ? 3 : 2;
    if (first < 0xC2 || first > 0xF4 || text.size() < length) return {1, kNone};
    std::uint32_t point = first & (0x7Fu >> length);
    for (std::size_t i = 1; i < length; ++i) {
        if ((Byte(text, i) & 0xC0) != 0x80) return {1, kNone};
        point = (point << 6) | (Byte(text, i) & 0x3F);
    }
    const bool isSurrogate = point >= 0xD800 && point <= 0xDFFF;
    if (point < kLeast[length] || point > 0x10FFFF || isSurrogate) return {1, kNone};
    return {length, point};
}

bool TurnsDirection(std::uint32_t point) {
    return point == 0x061C || point == 0x200E || point == 0x200F || (point >= 0x202A && point <= 0x202E) ||
           (point >= 0x2066 && point <= 0x2069);
}

/// Whether a terminal or a reader of lines would take the character for more than a sign.
bool IsHarmful(std::uint32_t point) {
    return point < 0x20 || (point >= 0x7F && point <= 0x9F) || point == 0x2028 || point == 0x2029 ||
           point == 0xFEFF || point == kNone || TurnsDirection(point);
}

std::string Hex(std::uint32_t number, int digits) {
    std::string text;
    while (digits-- > 0) text += "0123456789abcdef"[(number >> (4 * digits)) & 15];
    return text;
}

std::string Escape(std::string_view bytes, std::uint32_t point) {
    if (point == '\n') return "\\n";
    if (point == '\r') return "\\r";
    if (point == '\t') return "\\t";
    if (point == kNone || point < 0x80) return "\\x" + Hex(Byte(bytes, 0), 2);
    return "\\u" + Hex(point, 4);
}

bool StartsCharacter(char byte) {
    return (static_cast<unsigned char>(byte) & 0xC0) != 0x80;
}

/// The place in bytes of the character of that number; the size of the text if it has fewer.
std::size_t PlaceOf(std::string_view text, std::size_t character) {
    for (std::size_t at = 0; at < text.size(); ++at)
        if (StartsCharacter(text[at]) && character-- == 0) return at;
    return text.size();
}

} // namespace

std::string Printable(std::string_view text) {
    std::string printable;
    printable.reserve(text.size());
    while (!text.empty()) {
        const Character next = FirstCharacter(text);
        if (IsHarmful(next.point))
            printable += Escape(text, next.point);
        else
            printable += text.substr(0, next.length);
        text.remove_prefix(next.length);
    }
    return printable;
}

std::string PrintableLines(std::string_view text) {
    std::string printable;
    for (;;) {
        const std::size_t end = text.find_first_of("\n\t");
        printable += Printable(text.substr(0, end));
        if (end == std::string_view::npos) return printable;
        printable += text[end];
        text.remove_prefix(end + 1);
    }
}

std::size_t CharacterCount(std::string_view text) {
    return static_cast<std::size_t>(std::ranges::count_if(text, StartsCharacter));
}

std::string_view FirstCharacters(std::string_view text, std::size_t count) {
    return text.substr(0, PlaceOf(text, count));
}

std::string ShortenedAtEnd(std::string_view text, std::size_t width) {
    if (!width || CharacterCount(text) <= width) return std::string(text);
    return std::string(FirstCharacters(text, width - 1)) + "…";
}

std::string ShortenedInMiddle(std::string_view text, std::size_t width) {
    const std::size_t count = CharacterCount(text);
    if (!width || count <= width) return std::string(text);
    const std::size_t tail = (width - 1) / 2;
    return std::string(FirstCharacters(text, width - 1 - tail)) + "…" +
           std::string(text.substr(PlaceOf(text, count - tail)));
}

} // namespace ovrin
