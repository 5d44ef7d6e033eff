#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace ovrin {

/// A text as it may stand in a line of a terminal: line breaks, control characters, marks that turn the
/// direction of writing and bytes that are no UTF-8 stand as escapes (`\n`, `\x1b`, `\u202e`). All else,
/// backslashes too, stays as it is.
std::string Printable(std::string_view text);
/// The same of a text of several lines, which keeps its line breaks and tabs.
std::string PrintableLines(std::string_view text);

/// Characters of a text that is printable; combining marks count as well.
std::size_t CharacterCount(std::string_view text);

/// The first characters of a printable text, or all of it.
std::string_view FirstCharacters(std::string_view text, std::size_t count);

/// A printable text of at most `width` characters: its beginning, and "…" for what is left out. 0 is no
/// limit.
std::string ShortenedAtEnd(std::string_view text, std::size_t width);
/// The same with "…" in the middle.
std::string ShortenedInMiddle(std::string_view text, std::size_t width);

} // namespace ovrin
