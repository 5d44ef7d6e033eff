#include "Words/Markdown.h"

#include <algorithm>

namespace ovrin {

std::string CodeSpan(std::string_view text) {
    if (text.empty()) return {};
    std::size_t longest = 0, run = 0;
    for (const char letter : text) {
        run = letter == '`' ? run + 1 : 0;
        longest = std::max(longest, run);
    }
    const std::string fence(longest + 1, '`');
    // One blank at both ends is taken off again.
    const bool needsBlanks =
        text.front() == '`' || text.back() == '`' || (text.front() == ' ' && text.back() == ' ');
    const char* const blank = needsBlanks ? " " : "";
    return fence + blank + std::string(text) + blank + fence;
}

} // namespace ovrin
