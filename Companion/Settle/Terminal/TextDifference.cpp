#include "Settle/Terminal/TextDifference.h"

#include <algorithm>
#include <cctype>

namespace ovrin {

namespace {

/// Differences of more words than this aren't looked for one by one.
constexpr int kMostEdits = 600;

bool IsOfWord(char letter) {
    return static_cast<unsigned char>(letter) >= 0x80 || std::isalnum(static_cast<unsigned char>(letter)) ||
           letter == '_';
}

/// A number with its sign and point is one word.
bool GoesOn(std::string_view text, std::size_t at) {
    if (IsOfWord(text[at])) return true;
    const bool isInNumber = text[at] == '.' && at + 1 < text.size() &&
                            std::isdigit(static_cast<unsigned char>(text[at - 1])) &&
                            std::isdigit(static_cast<unsigned char>(text[at + 1]));
    return isInNumber;
}

std::vector<std::string_view> WordsOf(std::string_view text) {
    std::vector<std::string_view> words;
    for (std::size_t at = 0; at < text.size();) {
        std::size_t end = at + 1;
        if (IsOfWord(text[at]) || (text[at] == '-' && end < text.size() && IsOfWord(text[end])))
            while (end < text.size() && GoesOn(text, end)) ++end;
        words.push_back(text.substr(at, end - at));
        at = end;
    }
    return words;
}

using Words = std::vector<std::string_view>;

/// The shortest row of edits from one list of words to another, by the greedy search along diagonals: after d
/// edits, reached[k] is how far one gets in `text` where text is k words ahead of other.
class EditSearch {
public:
    EditSearch(const Words& text, const Words& other, std::size_t begin, std::size_t textEnd,
               std::size_t otherEnd)
        : m_Text(text), m_Other(other), m_Begin(begin), m_TextCount(static_cast<int>(textEnd - begin)),
          m_OtherCount(static_cast<int>(otherEnd - begin)) {}

    /// Sets a flag for each word of the text that the other has; false if there are too many edits.
    bool MarkCommon(std::vector<bool>& isCommon) {
        for (int edits = 0; edits <= std::min(kMostEdits, m_TextCount + m_OtherCount); ++edits) {
            m_Trace.push_back(m_Reached);
            if (!Advance(edits)) continue;
            GoBack(edits, isCommon);
            return true;
        }
        return false;
    }

private:
    static constexpr int kMiddle = kMostEdits + 1;

    int Start(const std::vector<int>& reached, int edits, int diagonal) const {
        const bool isFromAbove =
            diagonal == -edits ||
            (diagonal != edits && reached[kMiddle + diagonal - 1] < reached[kMiddle + diagonal + 1]);
        return isFromAbove ? diagonal + 1 : diagonal - 1;
    }

    bool Advance(int edits) {
        for (int diagonal = -edits; diagonal <= edits; diagonal += 2) {
            int at = 0;
            if (edits > 0) {
                const int from = Start(m_Reached, edits, diagonal);
                at = m_Reached[kMiddle + from] + (from < diagonal ? 1 : 0);
            }
            while (at < m_TextCount && at - diagonal < m_OtherCount && at - diagonal >= 0 &&
                   m_Text[m_Begin + at] == m_Other[m_Begin + at - diagonal])
                ++at;
            m_Reached[kMiddle + diagonal] = at;
            if (at >= m_TextCount && at - diagonal >= m_OtherCount) return true;
        }
        return false;
    }

    void GoBack(int edits, std::vector<bool>& isCommon) const {
        int at = m_TextCount, diagonal = m_TextCount - m_OtherCount;
        for (; edits > 0; --edits) {
            const std::vector<int>& reached = m_Trace[edits];
            const int from = Start(reached, edits, diagonal);
            const int edited = reached[kMiddle + from] + (from < diagonal ? 1 : 0);
            while (at > edited) isCommon[m_Begin + --at] = true;
            at = reached[kMiddle + from];
            diagonal = from;
        }
        while (at > 0) isCommon[m_Begin + --at] = true;
    }

    const Words& m_Text;
    const Words& m_Other;
    const std::size_t m_Begin;
    const int m_TextCount, m_OtherCount;
    std::vector<int> m_Reached = std::vector<int>(2 * kMiddle + 1, 0);
    std::vector<std::vector<int>> m_Trace;
};

bool IsWord(std::string_view word) {
    return IsOfWord(word.back()) || word == "\n";
}

/// Blanks and signs between two differences are of them: nobody reads what is left so.
void CloseGaps(const Words& words, std::vector<bool>& isCommon) {
    std::size_t last = words.size(); // the last word that differs
    for (std::size_t at = 0; at < words.size(); ++at) {
        if (isCommon[at] && IsWord(words[at])) last = words.size();
        if (isCommon[at]) continue;
        if (last != words.size())
            for (std::size_t between = last + 1; between < at; ++between) isCommon[between] = false;
        last = at;
    }
}

} // namespace

std::vector<TextRange> PartsNotIn(std::string_view text, std::string_view other) {
    const Words words = WordsOf(text), others = WordsOf(other);
    const std::size_t least = std::min(words.size(), others.size());
    std::size_t begin = 0, behind = 0;
    while (begin < least && words[begin] == others[begin]) ++begin;
    while (behind < least - begin && words[words.size() - 1 - behind] == others[others.size() - 1 - behind])
        ++behind;
    std::vector<bool> isCommon(words.size(), true);
    for (std::size_t at = begin; at < words.size() - behind; ++at) isCommon[at] = false;
    EditSearch(words, others, begin, words.size() - behind, others.size() - behind).MarkCommon(isCommon);
    CloseGaps(words, isCommon);
    std::vector<TextRange> parts;
    for (std::size_t at = 0; at < words.size(); ++at) {
        if (isCommon[at]) continue;
        const auto place = static_cast<std::size_t>(words[at].data() - text.data());
        if (parts.empty() || parts.back().end != place) parts.push_back({place, place});
        parts.back().end = place + words[at].size();
    }
    return parts;
}

} // namespace ovrin
