#include "Settle/Terminal/StyledText.h"

#include "Settle/Terminal/Letters.h"

#include <algorithm>
#include <string_view>

namespace ovrin {

namespace {

/// The part of a line between two places, counted in bytes of its text.
StyledLine Part(const StyledLine& line, std::size_t begin, std::size_t end) {
    StyledLine part;
    std::size_t at = 0;
    for (const StyledSpan& span : line) {
        const std::size_t from = std::max(begin, at), to = std::min(end, at + span.text.size());
        if (from < to) part.push_back({span.text.substr(from - at, to - from), span.style});
        at += span.text.size();
    }
    return part;
}

/// Where a line that begins here ends: behind its last blank, if the whole doesn't fit.
std::size_t BreakIn(std::string_view text, std::size_t columns) {
    const std::size_t most = BytesWithin(text, columns);
    if (most == text.size()) return most;
    if (most == 0) return FirstCharacterBytes(text); // wider than the line
    const std::size_t blank = text.substr(0, most).find_last_of(' ');
    const bool isBlankAhead = blank == std::string_view::npos ||
                              text.substr(0, blank).find_first_not_of(' ') == std::string_view::npos;
    return text[most] == ' ' || isBlankAhead ? most : blank + 1;
}

} // namespace

std::size_t ColumnsOf(const StyledLine& line) {
    std::size_t columns = 0;
    for (const StyledSpan& span : line) columns += ColumnsOf(span.text);
    return columns;
}

std::string TextOf(const StyledLine& line) {
    std::string text;
    for (const StyledSpan& span : line) text += span.text;
    return text;
}

StyledLine Fitted(const StyledLine& line, std::size_t columns, Style filling) {
    StyledLine fitted = Part(line, 0, BytesWithin(TextOf(line), columns));
    const std::size_t rest = columns - std::min(columns, ColumnsOf(fitted));
    if (rest) fitted.push_back({std::string(rest, ' '), filling});
    return fitted;
}

std::vector<StyledLine> Wrapped(const StyledLine& line, std::size_t columns) {
    const std::string text = TextOf(line);
    std::vector<StyledLine> lines;
    std::size_t begin = 0;
    do {
        const std::size_t end =
            begin + (begin < text.size() ? BreakIn(std::string_view(text).substr(begin), columns) : 0);
        lines.push_back(Part(line, begin, end));
        begin = end;
        // The blank at which a line is broken stands on neither.
        if (begin < text.size() && text[begin] == ' ' && text[begin - 1] != ' ') ++begin;
    } while (begin < text.size());
    return lines;
}

void Append(StyledLine& line, const StyledLine& more) {
    line.insert(line.end(), more.begin(), more.end());
}

} // namespace ovrin
