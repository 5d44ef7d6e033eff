#include "Setup/MarkedBlock.h"

#include "Words/Failure.h"

#include <algorithm>
#include <cstdint>
#include <cstdio>

namespace ovrin {

namespace {

constexpr std::string_view kFirstMark = "# >>> ovrin setup ";
constexpr std::string_view kFirstMarkEnd = " >>>";
constexpr std::string_view kAdvice = " \"ovrin setup --undo\" takes this out";
constexpr std::string_view kLastMark = "# <<< ovrin setup <<<";
constexpr std::string_view kMadeFile = ", made this file";
constexpr std::string_view kMadeFolders = " and folders: ";
constexpr std::string_view kHadNoLineEnd = ", added a line end";

/// FNV-1a over what isn't a carriage return: an editor may have changed the line ends of the whole file.
std::string Checksum(std::string_view lines) {
    std::uint32_t sum = 2166136261U;
    for (const char character : lines)
        if (character != '\r') sum = (sum ^ static_cast<unsigned char>(character)) * 16777619U;
    char text[9];
    std::snprintf(text, sizeof(text), "%08x", static_cast<unsigned>(sum));
    return text;
}

std::string FirstMarkText(const std::string& lines, const BlockOrigin& origin) {
    std::string text(kFirstMark);
    text += Checksum(lines);
    if (origin.madeFile) text += kMadeFile;
    if (origin.madeFolders > 0) (text += kMadeFolders) += std::to_string(origin.madeFolders);
    if (origin.hadNoLineEnd) text += kHadNoLineEnd;
    return (text += kFirstMarkEnd) += kAdvice;
}

BlockOrigin OriginFrom(std::string_view mark) {
    BlockOrigin origin;
    origin.madeFile = mark.find(kMadeFile) != std::string_view::npos;
    origin.hadNoLineEnd = mark.find(kHadNoLineEnd) != std::string_view::npos;
    const std::size_t folders = mark.find(kMadeFolders);
    constexpr unsigned kMost = 9; // a home directory isn't that far away from its files
    if (folders != std::string_view::npos && folders + kMadeFolders.size() < mark.size())
        origin.madeFolders =
            std::min(kMost, static_cast<unsigned>(mark[folders + kMadeFolders.size()] - '0'));
    return origin;
}

std::size_t LineEnd(std::string_view text, std::size_t position) {
    const std::size_t end = text.find('\n', position);
    return end == std::string_view::npos ? text.size() : end + 1;
}

/// What stands in front of the mark belongs to the block, unless it is nothing.
std::string FirstLine(std::string_view text) {
    while (text.ends_with(' ')) text.remove_suffix(1);
    return text.empty() ? std::string() : std::string(text) + '\n';
}

bool EndsWithLineEnd(std::string_view text) {
    return text.empty() || text.ends_with('\n');
}

std::string WithLineEndsOf(std::string_view text, const std::string& lines) {
    const std::size_t end = text.find('\n');
    if (end == std::string_view::npos || end == 0 || text[end - 1] != '\r') return lines;
    std::string changed;
    for (const char character : lines) {
        if (character == '\n') changed += '\r';
        changed += character;
    }
    return changed;
}

} // namespace

std::optional<MarkedBlock> FindBlock(std::string_view text, const std::string& path) {
    const std::size_t mark = text.find(kFirstMark);
    if (mark == std::string_view::npos) return {};
    const std::size_t begin = text.rfind('\n', mark) + 1; // npos + 1 is 0
    const std::size_t linesBegin = LineEnd(text, mark);
    std::size_t last = linesBegin;
    while (last < text.size() && !text.substr(last).starts_with(kLastMark)) last = LineEnd(text, last);
    if (last == text.size()) {
        const auto number = std::ranges::count(text.substr(0, mark), '\n') + 1;
        throw Failure("somebody took the end out of what setup wrote into " + path + ", from line " +
                      std::to_string(number) + " on: take out the rest by hand");
    }
    const std::string_view markText = text.substr(mark, linesBegin - mark);
    std::string lines = FirstLine(text.substr(begin, mark - begin));
    lines += text.substr(linesBegin, last - linesBegin);
    const bool isUnchanged = markText.substr(kFirstMark.size()).starts_with(Checksum(lines));
    return MarkedBlock{begin, LineEnd(text, last), std::move(lines), OriginFrom(markText), isUnchanged};
}

std::string MarkLines(const std::string& lines, const BlockOrigin& origin, FirstMark mark) {
    const std::string first = FirstMarkText(lines, origin);
    std::string text;
    if (mark == FirstMark::OnItsOwnLine) {
        text = first + '\n' + lines;
    } else {
        const std::size_t end = lines.find('\n');
        text = lines.substr(0, end) + ' ' + first + lines.substr(end);
    }
    return (text += kLastMark) + '\n';
}

std::string AddBlock(const std::string& text, std::size_t position, const std::string& lines,
                     BlockOrigin origin, FirstMark mark) {
    std::string before = text.substr(0, position);
    origin.hadNoLineEnd = !EndsWithLineEnd(before);
    if (origin.hadNoLineEnd) before += WithLineEndsOf(text, "\n");
    return before + WithLineEndsOf(text, MarkLines(lines, origin, mark)) + text.substr(position);
}

std::string ReplaceBlock(const std::string& text, const MarkedBlock& block, const std::string& lines,
                         FirstMark mark) {
    // The text may have a lone carriage return in front of the line end that the block brought.
    const std::string_view own = std::string_view(text).substr(block.begin, block.end - block.begin);
    return text.substr(0, block.begin) + WithLineEndsOf(own, MarkLines(lines, block.origin, mark)) +
           text.substr(block.end);
}

std::string RemoveBlock(const std::string& text, const MarkedBlock& block, const std::string& kept) {
    std::string before = text.substr(0, block.begin);
    const bool isLast = block.end == text.size() && kept.empty();
    if (block.origin.hadNoLineEnd && isLast) {
        const bool hasLongLineEnds = text.ends_with("\r\n"); // as the block has them
        if (before.ends_with('\n')) before.pop_back();
        if (hasLongLineEnds && before.ends_with('\r')) before.pop_back();
    }
    return before + kept + text.substr(block.end);
}

} // namespace ovrin
