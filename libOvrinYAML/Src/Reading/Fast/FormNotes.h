#pragma once

#include "Reading/Fast/FormCursor.h"

#include <string_view>

namespace ovrin_yaml {

/// Whether a document stands as the writer would write it, to the letter. A document that means the same in
/// another form is read as well, only its bytes can't stand for it.
///
///     m_Name: a b        as written
///     m_Name: 'a b'      not so: the writer quotes only where it must
///     m_Name: "a         nor this: the writer breaks a line only behind its width
///       b"
class FormNotes {
public:
    void Begin() { m_IsAsWritten = true; }
    bool IsAsWritten() const { return m_IsAsWritten; }

    void NoteIf(bool differs) { m_IsAsWritten = m_IsAsWritten && !differs; }
    /// A plain key, or a quoted one with its quotes. True if the writer would write it so.
    bool NoteKey(std::string_view text);
    /// A text that stands for itself on the line that `lineStart` begins: the writer breaks lines at blanks
    /// behind the width, and quotes what could be taken for the mark of a document.
    void NoteText(std::string_view text, const char* lineStart) {
        const char* begin = text.data();
        if (begin[0] == begin[1] && (*begin == kDocumentMark[0] || *begin == kDocumentEnd[0]))
            NoteIf(IsLikeMark(text));
        if (static_cast<std::size_t>(begin + text.size() - lineStart) > kLineWidth)
            NoteLongText(text, lineStart);
    }
    /// Such a text between quotes.
    void NoteQuoted(char quote, std::string_view text, bool inFlow, const char* lineStart);

private:
    void NoteLongText(std::string_view text, const char* lineStart);

    bool m_IsAsWritten = false;
};

} // namespace ovrin_yaml
