#pragma once

#include "Reading/Fast/FormReading.h"

namespace ovrin_yaml {

/// Reads flow collections in the form that the writer gives them.
///
///     {fileID: 12, guid: ab, list: [1, 2],
///       type: 3}                             a line is broken behind the first comma beyond its width
template <class Builder> class FlowReader {
public:
    /// Reads what `form` has under way; that must outlive this.
    explicit FlowReader(FormReading<Builder>& form) : m_Form(form) {}

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
    bool ReadByShape(KnownKey& parent);
    bool ReadByShape(const FlowShape& shape);
    void LearnShape(const char* begin, KnownKey& parent);
    KnownKey& ReadKey(const KnownKey& parent, KeyGuess& guess);
    void ReadQuotedKey();
    void ReadSequence(KnownKey& parent);
    void ReadValue(KnownKey& parent);
    static bool StartsText(char first) {
        return first != '{' && first != '[' && first != '\'' && first != '"';
    }
    const char* ScanText();
    bool SkipUsualSeparator();
    bool ReadSeparator(char close);
    void NoteWidth() { m_Form.notes.NoteIf(m_Form.cursor.Column() > kLineWidth); }

    FormReading<Builder>& m_Form;
    int m_Indent = 0; // where the collection under way goes on in a new line
};

template <class Builder> void FlowReader<Builder>::ReadCollection(KnownKey& parent) {
    const Nesting nesting(m_Form.depth);
    m_Indent += kIndentStep;
    if (*m_Form.cursor == '{')
        ReadMapping(parent);
    else
        ReadSequence(parent);
    m_Indent -= kIndentStep;
}

template <class Builder> void FlowReader<Builder>::ReadMapping(KnownKey& parent) {
    FormCursor& cursor = m_Form.cursor;
    if constexpr (Builder::kKnowsShapes)
        if (parent.shapes && ReadByShape(parent)) return;
    const char* const begin = cursor.Position();
    const std::size_t mark = m_Form.builder.Mark();
    const std::uint32_t line = cursor.Line();
    bool hasUsualKeys = true;
    cursor.Skip();
    if (*cursor == '}') {
        cursor.Skip();
    } else {
        NoteWidth();
        KeyGuess* guess = &parent.inside;
        do {
            KnownKey& key = ReadKey(parent, *guess);
            hasUsualKeys = hasUsualKeys && &key != &m_Form.keys.Unknown();
            ReadValue(key);
            guess = &key.next;
        } while (SkipUsualSeparator() || ReadSeparator('}'));
    }
    m_Form.CloseMapping(mark, true, line);
    if constexpr (Builder::kKnowsShapes)
        if (hasUsualKeys && cursor.Line() == line) LearnShape(begin, parent);
}

/// Reads a mapping of a shape that is known, in far less time than pair by pair. False, with nothing read, if
/// it has another.
template <class Builder> bool FlowReader<Builder>::ReadByShape(KnownKey& parent) {
    if (ReadByShape(parent.shapes->Latest())) return true;
    if (!ReadByShape(parent.shapes->Earlier())) return false;
    parent.shapes->TakeEarlier();
    return true;
}

template <class Builder> bool FlowReader<Builder>::ReadByShape(const FlowShape& shape) {
    if (shape.Count() == 0) return false;
    FormCursor& cursor = m_Form.cursor;
    const char* const begin = cursor.Position();
    std::string_view fileID;
    const char* position = begin;
    for (std::size_t pair = 0; pair < shape.Count(); ++pair) {
        position = shape.Match(pair, position);
        if (!position || !StartsText(*position)) break;
        cursor.MoveTo(position);
        const char* const end = ScanText();
        if (pair == shape.FileIDPair()) fileID = {position, end};
        position = end;
    }
    if (position) position = shape.Match(shape.Count(), position);
    const bool isRead = position && static_cast<std::size_t>(position - cursor.LineStart()) <= kLineWidth;
    cursor.MoveTo(isRead ? position : begin);
    if (isRead) m_Form.builder.AddMapping(shape.facts, fileID);
    return isRead;
}

/// Of the mapping from `begin` to here, which stands on one line and has no keys but such as may be guessed.
template <class Builder> void FlowReader<Builder>::LearnShape(const char* begin, KnownKey& parent) {
    // Behind the width lines are broken.
    if (m_Form.cursor.Column() > kLineWidth) return;
    FlowShape shape = FlowShape::Of({begin, m_Form.cursor.Position()});
    if (shape.Count() == 0) return;
    shape.facts = m_Form.builder.FactsOfLast();
    if (!parent.shapes) parent.shapes = std::make_unique<FlowShapes>();
    parent.shapes->Learn(shape);
}

/// Ends at the first character of the value.
template <class Builder> KnownKey& FlowReader<Builder>::ReadKey(const KnownKey& parent, KeyGuess& guess) {
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
    if (cursor.Position() - begin > m_Form.kLongestKey + 1 || *cursor != ' ') throw NotSure();
    cursor.Skip();
    return *key;
}

/// Ends behind the colon.
template <class Builder> void FlowReader<Builder>::ReadQuotedKey() {
    FormCursor& cursor = m_Form.cursor;
    const char* begin = cursor.Position();
    const std::uint32_t line = cursor.Line();
    m_Form.builder.AddScalar(YAMLScalar::Lookup(m_Form.quoted.Read({true, QuotedPlace::kKey})));
    if (cursor.Line() != line) throw NotSure();
    m_Form.notes.NoteKey({begin, cursor.Position()});
    if (*cursor != ':') throw NotSure();
    cursor.Skip();
}

template <class Builder> void FlowReader<Builder>::ReadSequence(KnownKey& parent) {
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

template <class Builder> void FlowReader<Builder>::ReadValue(KnownKey& parent) {
    const char first = *m_Form.cursor;
    if (first == '{' || first == '[') {
        ReadCollection(parent);
    } else if (!StartsText(first)) {
        m_Form.AddQuoted({true, m_Indent + kIndentStep});
    } else {
        const char* end = ScanText();
        m_Form.builder.AddText({m_Form.cursor.Position(), end});
        m_Form.cursor.MoveTo(end);
    }
}

/// The end of the plain text here.
template <class Builder> const char* FlowReader<Builder>::ScanText() {
    const char* begin = m_Form.cursor.Position();
    const char* end = ScanPlainInFlow(begin);
    m_Form.notes.NoteText({begin, end}, m_Form.cursor.LineStart());
    return end;
}

/// The same as ReadSeparator for what nearly always stands there.
template <class Builder> inline bool FlowReader<Builder>::SkipUsualSeparator() {
    FormCursor& cursor = m_Form.cursor;
    if (*cursor != ',' || cursor[1] != ' ' || cursor.Column() >= kLineWidth) return false;
    cursor.Skip(2);
    return true;
}

/// Behind an entry: true at the first character of the next, false behind the closing bracket.
template <class Builder> bool FlowReader<Builder>::ReadSeparator(char close) {
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
