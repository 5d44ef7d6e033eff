#pragma once

#include "Reading/Fast/PlainScan.h"

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace ovrin_yaml {

/// Where the fast reader stands in a document.
///
///     Transform:          NextLine() leads from the end of this line
///       m_Name: Box       to the "m" here: Indent() 2, Column() 2
///
/// What is looked at may lie some bytes behind the document's end, where anything may stand that can be read.
class FormCursor {
public:
    /// Indent() at the end of the document.
    static constexpr int kAtEnd = -1;

    /// Stands at the start of `text`, which ends in a line end and must stay. `line` is that of its start.
    void Begin(std::string_view text, std::uint32_t line) {
        m_Position = m_LineStart = text.data();
        m_End = m_Position + text.size();
        m_Line = line;
        m_Indent = 0;
    }

    char operator*() const { return *m_Position; }
    char operator[](std::ptrdiff_t offset) const { return m_Position[offset]; }
    const char* Position() const { return m_Position; }
    std::string_view Rest() const { return {m_Position, m_End}; }
    bool IsAtEnd() const { return m_Position == m_End; }
    std::uint32_t Line() const { return m_Line; }
    /// Blanks in front of the line under way, or kAtEnd.
    int Indent() const { return m_Indent; }
    const char* LineStart() const { return m_LineStart; }
    std::size_t Column() const { return static_cast<std::size_t>(m_Position - m_LineStart); }

    void MoveTo(const char* position) { m_Position = position; }
    void Skip(std::ptrdiff_t count = 1) { m_Position += count; }
    bool SkipIf(std::string_view text) {
        if (!Rest().starts_with(text)) return false;
        m_Position += text.size();
        return true;
    }
    /// Behind the line end here.
    void SkipLineEnd() {
        m_LineStart = ++m_Position;
        ++m_Line;
    }
    /// From the line end here to the first character of the next line that is no blank. Not sure of an empty
    /// line, and of one that could end the document.
    void NextLine() {
        SkipLineEnd();
        if (IsAtEnd()) {
            m_Indent = kAtEnd;
            return;
        }
        const char* line = m_Position;
        m_Position = SkipBlanks(line);
        m_Indent = static_cast<int>(m_Position - line);
        if (*m_Position == '\n') throw NotSure();
        if (m_Indent == 0 && (*line == '.' || (*line == '-' && line[1] == '-'))) throw NotSure();
    }
    /// What stands here counts as the start of a line of that indent: it is the first thing behind a dash.
    void SetIndent(int indent) { m_Indent = indent; }
    bool IsAtListItem() const {
        return *m_Position == '-' && (m_Position[1] == ' ' || m_Position[1] == '\n');
    }

private:
    const char* m_Position = nullptr;
    const char* m_End = nullptr;
    const char* m_LineStart = nullptr;
    std::uint32_t m_Line = 0;
    int m_Indent = 0;
};

} // namespace ovrin_yaml
