#pragma once

#include "Reading/Fast/FormReading.h"

namespace ovrin_yaml {

/// Reads flow collections in the form that the writer gives them.
///
///     {fileID: 12, guid: ab, list: [1, 2],
///       type: 3}                             a line is broken behind the first comma beyond its width
class FlowReader {
public:
    /// Reads what `form` has under way; that must outlive this.
    explicit FlowReader(FormReading& form) : m_Form(form) {}

    /// Reads the collection whose bracket stands here, and ends behind it. `indent` is that of the line, and
    /// `parent` the key that the collection stands under.
    void Read(int indent, KnownKey& parent) {
        m_Indent = indent;
        ReadCollection(parent);
    }

private:
    // Each function begins at the first character of its node and ends behind the last.

    void ReadCollection(KnownKey& parent);
    void ReadMapping(KnownKey& parent);
    KnownKey& ReadKey(const KnownKey& parent, KeyGuess& guess);
    void ReadQuotedKey();
    void ReadSequence(KnownKey& parent);
    void ReadValue(KnownKey& parent);
    const char* ScanText();
    bool SkipUsualSeparator();
    bool ReadSeparator(char close);
    void NoteWidth() { m_Form.notes.NoteIf(m_Form.cursor.Column() > kLineWidth); }

    FormReading& m_Form;
    int m_Indent = 0; // where the collection under way goes on in a new line
};

} // namespace ovrin_yaml
