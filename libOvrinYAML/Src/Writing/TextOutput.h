#pragma once

#include "Writing/WrittenForm.h"

#include <cstddef>
#include <string>
#include <string_view>

namespace ovrin_yaml {

/// The end of a growing text: appends, and knows the column. Written text is ASCII, so columns are bytes.
class TextOutput {
public:
    /// Appends to `text`, at column 0 whatever it ends in.
    explicit TextOutput(std::string& text) : m_Text(text), m_LineStart(text.size()) {}

    /// `character` and `characters` are no line breaks.
    void Put(char character) { m_Text.push_back(character); }
    void Put(std::string_view characters) { m_Text.append(characters); }
    /// Starts a line with `indent` blanks.
    void Break(int indent) {
        m_Text.push_back('\n');
        m_LineStart = m_Text.size();
        m_Text.append(static_cast<std::size_t>(indent), ' ');
    }
    /// Characters on the current line so far.
    std::size_t Column() const { return m_Text.size() - m_LineStart; }
    bool IsBeyondWidth() const { return Column() > kLineWidth; }

private:
    std::string& m_Text;
    std::size_t m_LineStart;
};

} // namespace ovrin_yaml
