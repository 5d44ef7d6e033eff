#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace ovrin {

/// What a piece of text is, from which a terminal takes its looks.
enum class Style : std::uint8_t {
    Plain,
    Faint,    ///< what is settled, ids, hints
    Strong,   ///< names
    Bar,      ///< the line at the top
    Selected, ///< where a person stands
    Key,      ///< what can be pressed
    Base,     ///< words for a side
    Ours,
    Theirs,
    Difference, ///< what other sides don't have
    Warning,
};

struct StyledSpan {
    std::string text; ///< shown (Settle/Terminal/Letters.h)
    Style style = Style::Plain;
};
/// A line of a screen, or of what is to be broken into such.
using StyledLine = std::vector<StyledSpan>;

std::size_t ColumnsOf(const StyledLine& line);
std::string TextOf(const StyledLine& line);

/// The line at exactly so many columns: cut, or filled up with blanks of the style.
StyledLine Fitted(const StyledLine& line, std::size_t columns, Style filling = Style::Plain);

/// The line in lines of at most so many columns, broken behind blanks where there are any. At least one.
std::vector<StyledLine> Wrapped(const StyledLine& line, std::size_t columns);

/// Puts spans at the end.
void Append(StyledLine& line, const StyledLine& more);

} // namespace ovrin
