#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace ovrin_yaml {

// The written form: what the writer of object files and the readers that know it without a YAML parser must
// agree on. A change here changes both sides.
//
//     %YAML 1.1
//     %TAG !o! tag:ovrin.dev,2011:     the file's header
//     --- !o!4 &12 stripped            an object's header line: class id, file id, and a mark that few have
//     Transform:                       block style, one step further in on each level
//       m_Children:
//       - {fileID: 14}                 list items at the column of their key; flow collections
//       m_Name: 'a: b'                 plain and quoted texts

// Files and documents.

/// A file's header up to the authority that its tags belong to.
inline constexpr std::string_view kFileHeaderStart = "%YAML 1.1\n%TAG !o! tag:";
inline constexpr std::string_view kFileHeaderEnd = ",2011:\n"; // behind the tag authority
inline constexpr std::string_view kFileSignature = kFileHeaderStart.substr(0, 5);
inline constexpr std::uint32_t kFileHeaderLines = 2;

/// A header line up to the class id, with the line end in front of it, or without.
inline constexpr std::string_view kNextHeader = "\n--- !o!";
inline constexpr std::string_view kDocumentStart = kNextHeader.substr(1);
inline constexpr std::string_view kDocumentMark = kDocumentStart.substr(0, 3);
inline constexpr std::string_view kDocumentEnd = "...";
/// Between class id and file id.
inline constexpr std::string_view kAnchor = " &";
inline constexpr char kAnchorSign = kAnchor.back();
/// At the end of some header lines.
inline constexpr std::string_view kStripped = " stripped";
inline constexpr std::string_view kStrippedWord = kStripped.substr(1);

/// Whether a text could be taken for the mark at the start or the end of a document.
constexpr bool IsLikeMark(std::string_view text) {
    return text.starts_with(kDocumentMark) || text.starts_with(kDocumentEnd);
}

// Lines.

/// Columns from one level to the next.
inline constexpr int kIndentStep = 2;
/// Lines that have passed this column are broken where that can be done.
inline constexpr std::size_t kLineWidth = 80;
/// Longer keys, in bytes, stand behind a question mark.
inline constexpr std::size_t kLongestSimpleKey = 128;

// Characters.

/// What a character can mean, as bits. One without any stands for itself wherever it stands.
///
///     a-z A-Z _ . / ...     none
///     0-9                   Id
///     -                     Id, LeadingSpaced
///     :                     Colon, LeadingSpaced
///     ?                     FlowIndicator, LeadingSpaced
///     , [ ] { }             FlowIndicator, Leading
///     #                     Hash, Leading
///     & * ! | > % @ `       Leading
///     ' "                   Leading, Quoting
///     \                     Quoting
struct Meaning {
    enum Bits : std::uint16_t {
        kBlank = 1,
        kLineFeed = 2,
        kSpecial = 4,         ///< can only be written as an escape
        kFlowIndicator = 8,   ///< has a meaning anywhere in a flow collection
        kColon = 16,          ///< the same, and ends a key if whitespace follows
        kHash = 32,           ///< begins a comment behind whitespace
        kLeading = 64,        ///< has a meaning as first character
        kLeadingSpaced = 128, ///< has a meaning as first character before whitespace
        kQuoting = 256,       ///< has a meaning between quotes of one kind or the other
        kId = 512,            ///< stands in class and file ids
        kNeverPlain = kBlank | kLineFeed | kSpecial,
    };
};

/// In ASCII; nothing else is written as it is.
constexpr bool IsPrintable(char c) {
    return c >= ' ' && c <= '~';
}

inline constexpr std::array<std::uint16_t, 256> kMeanings = [] {
    std::array<std::uint16_t, 256> meanings{};
    const auto add = [&meanings](std::string_view characters, std::uint16_t bit) {
        for (const char c : characters) meanings[static_cast<unsigned char>(c)] |= bit;
    };
    for (unsigned c = 0; c < 256; ++c)
        if (!IsPrintable(static_cast<char>(c)) && c != '\n') meanings[c] = Meaning::kSpecial;
    add(" ", Meaning::kBlank);
    add("\n", Meaning::kLineFeed);
    add(",?[]{}", Meaning::kFlowIndicator);
    add(":", Meaning::kColon);
    add("#", Meaning::kHash);
    add("#,[]{}&*!|>'\"%@`", Meaning::kLeading);
    add("-?:", Meaning::kLeadingSpaced);
    add("'\"\\", Meaning::kQuoting);
    add("0123456789-", Meaning::kId);
    return meanings;
}();

constexpr unsigned MeaningsOf(char c) {
    return kMeanings[static_cast<unsigned char>(c)];
}

/// Inside a plain text in block style, whatever stands beside it.
constexpr bool IsPlain(char c) {
    return !(MeaningsOf(c) & (Meaning::kNeverPlain | Meaning::kColon | Meaning::kHash));
}
/// The same in flow style.
constexpr bool IsPlainInFlow(char c) {
    return !(MeaningsOf(c) &
             (Meaning::kNeverPlain | Meaning::kColon | Meaning::kHash | Meaning::kFlowIndicator));
}
/// First in a plain text of any style, whatever follows.
constexpr bool IsPlainStart(char c) {
    return !(MeaningsOf(c) & (Meaning::kNeverPlain | Meaning::kLeading | Meaning::kLeadingSpaced));
}
/// Between quotes of any kind; a blank, too, although lines may be broken there.
constexpr bool IsPlainInQuotes(char c) {
    return !(MeaningsOf(c) & (Meaning::kSpecial | Meaning::kLineFeed | Meaning::kQuoting));
}

/// In double quotes all but printable ASCII is escaped: some characters by a letter behind the backslash, the
/// others by their number. A backslash also keeps a blank at the start of a line.
struct LetterEscape {
    char letter;
    char32_t character;
};
inline constexpr LetterEscape kLetterEscapes[] = {
    {'0', 0},    {'a', 7},   {'b', 8},     {'t', 9},    {'n', 10},   {'v', 11},     {'f', 12},     {'r', 13},
    {'e', 0x1b}, {'"', '"'}, {'\\', '\\'}, {'N', 0x85}, {'_', 0xa0}, {'L', 0x2028}, {'P', 0x2029},
};

/// The letters in front of a number, by its hexadecimal digits.
struct NumberEscape {
    char letter;
    int digits;
};
inline constexpr NumberEscape kNumberEscapes[] = {{'x', 2}, {'u', 4}, {'U', 8}};

// Ids.

/// The class or file id at a place in the text; empty if there is none.
constexpr std::string_view IdAt(std::string_view text, std::size_t position) {
    std::size_t end = position;
    while (end < text.size() && MeaningsOf(text[end]) & Meaning::kId) ++end;
    return end == position ? std::string_view() : text.substr(position, end - position);
}

/// The file id in the header line that a document begins with; empty if there is none.
constexpr std::string_view FileIDOf(std::string_view document) {
    const std::string_view line = document.substr(0, document.find('\n'));
    const std::size_t anchor = line.find(kAnchorSign);
    return anchor == line.npos ? std::string_view() : IdAt(line, anchor + 1);
}

} // namespace ovrin_yaml
