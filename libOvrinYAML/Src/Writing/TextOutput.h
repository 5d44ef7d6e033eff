#pragma once

#include "Writing/WrittenForm.h"

#include <array>
#include <cstddef>
#include <cstring>
#include <string>
#include <string_view>

namespace ovrin_yaml {

/// The end of a growing text: appends, and knows the column. Written text is ASCII, so columns are bytes.
///
/// It is gathered first, as asking a string for each character costs more than to write it: only Finish
/// brings all of it into the text.
class TextOutput {
public:
    /// Appends to `text`, at that column whatever it ends in.
    explicit TextOutput(std::string& text, std::size_t column = 0)
        : m_Text(text), m_Before(text.size()), m_LineStart(m_Before - column) {}
    TextOutput(const TextOutput&) = delete;
    TextOutput& operator=(const TextOutput&) = delete;

    /// `character` and `characters` are no line breaks.
    void Put(char character) { Append(character); }
    void Put(std::string_view characters) {
        if (characters.size() > m_Gathered.size() - m_Count) {
            Finish();
            if (characters.size() > m_Gathered.size()) return PutLong(characters);
        }
        std::memcpy(m_Gathered.data() + m_Count, characters.data(), characters.size());
        m_Count += characters.size();
    }
    /// Starts a line with `indent` blanks.
    void Break(int indent) {
        Append('\n');
        m_LineStart = Size();
        for (; indent > 0; --indent) Append(' ');
    }
    /// Characters on the current line so far.
    std::size_t Column() const { return Size() - m_LineStart; }
    bool IsBeyondWidth() const { return Column() > kLineWidth; }

    /// Brings what was gathered into the text.
    void Finish() {
        m_Text.append(m_Gathered.data(), m_Count);
        m_Before += m_Count;
        m_Count = 0;
    }

private:
    std::size_t Size() const { return m_Before + m_Count; }
    void Append(char character) {
        if (m_Count == m_Gathered.size()) [[unlikely]]
            Finish();
        m_Gathered[m_Count++] = character;
    }
    void PutLong(std::string_view characters) {
        m_Text.append(characters);
        m_Before += characters.size();
    }

    std::string& m_Text;
    std::size_t m_Before;    // characters in the text
    std::size_t m_LineStart; // where column 0 would be: may have wrapped round below 0
    std::size_t m_Count = 0;
    std::array<char, 2048> m_Gathered; // the first m_Count of them
};

} // namespace ovrin_yaml
