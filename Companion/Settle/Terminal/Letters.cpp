#include "Settle/Terminal/Letters.h"

#include "Names/PrintableText.h"

#include <cctype>
#include <clocale>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <cwchar>
#include <langinfo.h>
#include <utility>

namespace ovrin {

namespace {

constexpr std::size_t kNoCharacter = 0x80'0000'0000; // mbrtowc's errors are greater

/// A character and its place in a terminal's line.
struct Glyph {
    std::size_t bytes;
    std::uint32_t point;
    int columns; ///< -1: not known
};

Glyph FirstGlyph(std::string_view text) {
    const auto first = static_cast<unsigned char>(text.front());
    if (first < 0x80) return {1, first, 1};
    wchar_t point = 0;
    std::mbstate_t state{};
    const std::size_t bytes = std::mbrtowc(&point, text.data(), text.size(), &state);
    if (bytes == 0 || bytes >= kNoCharacter) return {1, first, -1};
    return {bytes, static_cast<std::uint32_t>(point), wcwidth(point)};
}

/// Joiners and blanks without width, behind which two texts that differ would look alike.
bool CannotBeSeen(std::uint32_t point) {
    return point == 0xAD || point == 0x200B || point == 0x200D || (point >= 0x2060 && point <= 0x2064) ||
           (point >= 0xE0000 && point <= 0xE007F);
}

std::string Escape(std::uint32_t point) {
    char text[16];
    std::snprintf(text, sizeof text, point > 0xFFFF ? "\\U%08x" : "\\u%04x", point);
    return text;
}

/// What the words of this program are written with, for terminals that have ASCII alone.
constexpr std::pair<std::string_view, const char*> kInASCII[] = {
    {"→", "->"}, {"←", "<-"}, {"↑", "Up"}, {"↓", "Down"}, {"…", "..."},
    {"·", "-"},  {"•", "*"},  {"│", "|"},  {"─", "-"},    {"–", "-"},
};

/// Of UTF-8, whatever the locale says.
std::string InASCII(std::string_view printable) {
    std::string text;
    while (!printable.empty()) {
        const auto* known = std::begin(kInASCII);
        while (known != std::end(kInASCII) && !printable.starts_with(known->first)) ++known;
        const std::string_view next =
            known != std::end(kInASCII) ? known->first : FirstCharacters(printable, 1);
        if (known != std::end(kInASCII)) {
            text += known->second;
        } else if (next.size() == 1) {
            text += next;
        } else {
            std::uint32_t point = static_cast<unsigned char>(next[0]) & (0x7Fu >> next.size());
            for (const char byte : next.substr(1)) point = (point << 6) | (byte & 0x3F);
            text += Escape(point);
        }
        printable.remove_prefix(next.size());
    }
    return text;
}

/// "de_DE.UTF-8", "de_DE.utf8", "de_DE.utf-8@euro".
bool IsNameOfUTF8(std::string locale) {
    for (char& letter : locale) letter = static_cast<char>(std::tolower(static_cast<unsigned char>(letter)));
    return locale.find(".utf-8") != std::string::npos || locale.find(".utf8") != std::string::npos;
}

} // namespace

Letters Letters::OfEnvironment() {
    const char* const set = std::setlocale(LC_CTYPE, "");
    const auto hasUTF8 = [] { return std::strcmp(nl_langinfo(CODESET), "UTF-8") == 0; };
    if (set) return Letters(hasUTF8());
    for (const char* name : {"LC_ALL", "LC_CTYPE", "LANG"}) {
        const char* const asked = std::getenv(name);
        if (!asked || !*asked) continue;
        return Letters(IsNameOfUTF8(asked) && std::setlocale(LC_CTYPE, "C.UTF-8") && hasUTF8());
    }
    return Letters(false);
}

std::string Letters::Shown(std::string_view text) const {
    const std::string printable = Printable(text);
    if (!m_IsUTF8) return InASCII(printable);
    std::string shown;
    for (std::string_view rest = printable; !rest.empty();) {
        const Glyph next = FirstGlyph(rest);
        shown += next.columns < 0 || CannotBeSeen(next.point) ? Escape(next.point)
                                                              : std::string(rest.substr(0, next.bytes));
        rest.remove_prefix(next.bytes);
    }
    return shown;
}

std::size_t ColumnsOf(std::string_view shown) {
    std::size_t columns = 0;
    while (!shown.empty()) {
        const Glyph next = FirstGlyph(shown);
        columns += next.columns < 0 ? 1 : static_cast<std::size_t>(next.columns);
        shown.remove_prefix(next.bytes);
    }
    return columns;
}

std::size_t BytesWithin(std::string_view shown, std::size_t columns) {
    std::size_t bytes = 0;
    while (bytes < shown.size()) {
        const Glyph next = FirstGlyph(shown.substr(bytes));
        const std::size_t wanted = next.columns < 0 ? 1 : static_cast<std::size_t>(next.columns);
        if (wanted > columns) break;
        columns -= wanted;
        bytes += next.bytes;
    }
    return bytes;
}

std::size_t FirstCharacterBytes(std::string_view shown) {
    return FirstGlyph(shown).bytes;
}

std::string EndWithin(const std::string& shown, std::size_t columns, const Letters& letters) {
    const std::size_t all = ColumnsOf(shown);
    if (all <= columns) return shown;
    const std::string mark = letters.Shown("…");
    if (columns <= mark.size()) return shown.substr(0, BytesWithin(shown, columns));
    std::size_t from = BytesWithin(shown, all - columns + ColumnsOf(mark));
    while (ColumnsOf(shown.substr(from)) + ColumnsOf(mark) > columns)
        from += FirstCharacterBytes(std::string_view(shown).substr(from));
    return mark + shown.substr(from);
}

std::string BeginningWithin(const std::string& shown, std::size_t columns, const Letters& letters) {
    if (ColumnsOf(shown) <= columns) return shown;
    const std::string mark = letters.Shown("…");
    if (columns <= mark.size()) return shown.substr(0, BytesWithin(shown, columns));
    return shown.substr(0, BytesWithin(shown, columns - ColumnsOf(mark))) + mark;
}

} // namespace ovrin
