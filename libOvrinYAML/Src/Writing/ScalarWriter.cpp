#include "Writing/ScalarWriter.h"

#include "Writing/WrittenForm.h"

#include <algorithm>
#include <iterator>

namespace ovrin_yaml {

namespace {

/// The blank at `at` has a neighbour on both sides, and the one before it is no blank.
bool EndsWordInside(std::string_view text, std::size_t at) {
    return at > 0 && at + 1 < text.size() && text[at - 1] != ' ';
}

/// Position of the first blank at or behind `from` that folds in plain text and single quotes.
std::size_t FindFold(std::string_view text, std::size_t from) {
    for (std::size_t at = text.find(' ', from); at != std::string_view::npos; at = text.find(' ', at + 1))
        if (EndsWordInside(text, at) && text[at + 1] != ' ') return at;
    return std::string_view::npos;
}

struct Character {
    char32_t code;
    std::size_t length; // in bytes
};

/// The UTF-8 character at the start of `text`; its first byte alone if bytes are missing behind it.
Character Decode(std::string_view text) {
    const unsigned char first = static_cast<unsigned char>(text[0]);
    const std::size_t length = first < 0xC0 ? 1 : first < 0xE0 ? 2 : first < 0xF0 ? 3 : first < 0xF8 ? 4 : 1;
    if (length == 1 || length > text.size()) return {first, 1};
    char32_t code = first & (0x7Fu >> length);
    for (std::size_t i = 1; i < length; ++i) {
        if ((text[i] & 0xC0) != 0x80) return {first, 1};
        code = code << 6 | (text[i] & 0x3Fu);
    }
    return {code, length};
}

void WriteEscape(TextOutput& output, char32_t code) {
    output.Put('\\');
    for (const LetterEscape& escape : kLetterEscapes)
        if (escape.character == code) return output.Put(escape.letter);
    const NumberEscape& escape =
        *std::find_if(std::begin(kNumberEscapes), std::prev(std::end(kNumberEscapes)),
                      [code](const NumberEscape& candidate) { return code >> 4 * candidate.digits == 0; });
    output.Put(escape.letter);
    for (int shift = 4 * (escape.digits - 1); shift >= 0; shift -= 4)
        output.Put("0123456789ABCDEF"[code >> shift & 15]);
}

bool IsEscaped(char c) {
    return !IsPrintable(c) || c == '"' || c == '\\';
}

} // namespace

void WritePlain(TextOutput& output, std::string_view text, Folding folding) {
    while (folding.allowed && output.Column() + text.size() > kLineWidth) {
        const std::size_t column = output.Column();
        const std::size_t at = FindFold(text, column > kLineWidth ? 0 : kLineWidth + 1 - column);
        if (at == std::string_view::npos) break;
        output.Put(text.substr(0, at));
        output.Break(folding.indent);
        text.remove_prefix(at + 1);
    }
    output.Put(text);
}

void WriteSingleQuoted(TextOutput& output, std::string_view text, Folding folding) {
    output.Put('\'');
    for (std::size_t at = 0; at < text.size();) {
        std::size_t run = at;
        while (run < text.size() && text[run] != ' ' && text[run] != '\'' && text[run] != '\n') ++run;
        output.Put(text.substr(at, run - at));
        if ((at = run) == text.size()) break;
        if (text[at] == '\'') {
            output.Put("''");
            ++at;
        } else if (text[at] == '\n') {
            const std::size_t end = std::min(text.find_first_not_of('\n', at), text.size());
            for (; at < end; ++at) output.Break(0);
            output.Break(end < text.size() ? folding.indent : 0);
        } else {
            const bool folds =
                folding.allowed && output.IsBeyondWidth() && EndsWordInside(text, at) && text[at + 1] != ' ';
            folds ? output.Break(folding.indent) : output.Put(' ');
            ++at;
        }
    }
    output.Put('\'');
}

void WriteDoubleQuoted(TextOutput& output, std::string_view text, Folding folding) {
    output.Put('"');
    for (std::size_t at = 0; at < text.size();) {
        std::size_t run = at;
        while (run < text.size() && text[run] != ' ' && !IsEscaped(text[run])) ++run;
        output.Put(text.substr(at, run - at));
        if ((at = run) == text.size()) break;
        if (text[at] != ' ') {
            const Character character = Decode(text.substr(at));
            WriteEscape(output, character.code);
            at += character.length;
        } else {
            if (folding.allowed && output.IsBeyondWidth() && EndsWordInside(text, at)) {
                output.Break(folding.indent);
                if (text[at + 1] == ' ') output.Put('\\');
            } else {
                output.Put(' ');
            }
            ++at;
        }
    }
    output.Put('"');
}

void WriteScalar(TextOutput& output, std::string_view text, ScalarForms forms, bool plainAllowed,
                 Folding folding) {
    if (plainAllowed)
        WritePlain(output, text, folding);
    else if (forms.singleQuoted)
        WriteSingleQuoted(output, text, folding);
    else
        WriteDoubleQuoted(output, text, folding);
}

} // namespace ovrin_yaml
