#include "Reading/Fast/FlowReader.h"

namespace ovrin_yaml {

void FlowReader::ReadCollection(KnownKey& parent) {
    const Nesting nesting(m_Form);
    m_Indent += kIndentStep;
    if (*m_Form.cursor == '{')
        ReadMapping(parent);
    else
        ReadSequence(parent);
    m_Indent -= kIndentStep;
}

void FlowReader::ReadMapping(KnownKey& parent) {
    FormCursor& cursor = m_Form.cursor;
    const std::size_t mark = m_Form.builder.Mark();
    const std::uint32_t line = cursor.Line();
    cursor.Skip();
    if (*cursor == '}') {
        cursor.Skip();
    } else {
        NoteWidth();
        KeyGuess* guess = &parent.inside;
        do {
            KnownKey& key = ReadKey(parent, *guess);
            ReadValue(key);
            guess = &key.next;
        } while (SkipUsualSeparator() || ReadSeparator('}'));
    }
    m_Form.CloseMapping(mark, true, line);
}

/// Ends at the first character of the value.
KnownKey& FlowReader::ReadKey(const KnownKey& parent, KeyGuess& guess) {
    FormCursor& cursor = m_Form.cursor;
    KnownKey* known = KnownKeys::Find(guess, cursor.Position());
    if (known && cursor[known->length + 1] == ' ') {
        m_Form.builder.AddNode(known->scalar, known->hash);
        cursor.Skip(known->length + 2);
        return *known;
    }
    const char* begin = cursor.Position();
    KnownKey* key = &m_Form.keys.Unknown();
    if (*begin == '\'' || *begin == '"') {
        ReadQuotedKey();
    } else {
        const char* end = ScanText();
        if (*end != ':') throw NotSure();
        key = &m_Form.AddKey(end, parent, guess);
    }
    if (cursor.Position() - begin > FormReading::kLongestKey + 1 || *cursor != ' ') throw NotSure();
    cursor.Skip();
    return *key;
}

/// Ends behind the colon.
void FlowReader::ReadQuotedKey() {
    FormCursor& cursor = m_Form.cursor;
    const char* begin = cursor.Position();
    const std::uint32_t line = cursor.Line();
    m_Form.builder.AddScalar(YAMLScalar::Lookup(m_Form.quoted.Read(true)));
    if (cursor.Line() != line) throw NotSure();
    m_Form.notes.NoteKey({begin, cursor.Position()});
    if (*cursor != ':') throw NotSure();
    cursor.Skip();
}

void FlowReader::ReadSequence(KnownKey& parent) {
    FormCursor& cursor = m_Form.cursor;
    const std::size_t mark = m_Form.builder.Mark();
    const std::uint32_t line = cursor.Line();
    cursor.Skip();
    if (*cursor == ']') {
        cursor.Skip();
    } else {
        NoteWidth();
        do {
            ReadValue(parent);
        } while (SkipUsualSeparator() || ReadSeparator(']'));
    }
    m_Form.builder.CloseSequence(mark, true, line);
}

void FlowReader::ReadValue(KnownKey& parent) {
    const char first = *m_Form.cursor;
    if (first == '{' || first == '[') {
        ReadCollection(parent);
    } else if (first == '\'' || first == '"') {
        m_Form.AddQuoted(true);
    } else {
        const char* end = ScanText();
        m_Form.builder.AddText({m_Form.cursor.Position(), end});
        m_Form.cursor.MoveTo(end);
    }
}

/// The end of the plain text here.
const char* FlowReader::ScanText() {
    const char* begin = m_Form.cursor.Position();
    const char* end = ScanPlainInFlow(begin);
    m_Form.notes.NoteText({begin, end}, m_Form.cursor.LineStart());
    return end;
}

/// The same as ReadSeparator for what nearly always stands there.
inline bool FlowReader::SkipUsualSeparator() {
    FormCursor& cursor = m_Form.cursor;
    if (*cursor != ',' || cursor[1] != ' ' || cursor.Column() >= kLineWidth) return false;
    cursor.Skip(2);
    return true;
}

/// Behind an entry: true at the first character of the next, false behind the closing bracket.
bool FlowReader::ReadSeparator(char close) {
    FormCursor& cursor = m_Form.cursor;
    const char sign = *cursor;
    if (sign != close && sign != ',') throw NotSure();
    cursor.Skip();
    if (sign == close) return false;
    const bool isFull = cursor.Column() > kLineWidth;
    if (*cursor == ' ') {
        m_Form.notes.NoteIf(isFull);
        cursor.Skip();
        return true;
    }
    if (*cursor != '\n') throw NotSure();
    cursor.NextLine();
    if (cursor.Indent() < 1) throw NotSure();
    m_Form.notes.NoteIf(!isFull || cursor.Indent() != m_Indent);
    return true;
}

} // namespace ovrin_yaml
