#pragma once

#include "Reading/Fast/FlowReader.h"
#include "Reading/Fast/FormReading.h"
#include "Values/YAMLScalar.h"

#include <cstdint>
#include <deque>
#include <string>
#include <string_view>

namespace ovrin_yaml {

/// Reads a document in the form that the writer gives it, many times faster than a YAML parser.
///
///     --- !o!4 &12 stripped         header line
///     Transform:                    block mapping; a mapping inside is two columns further in
///       m_Children:
///       - {fileID: 14}              list items at the column of their key; flow collections,
///       m_Name: 'a: b'              plain and quoted texts, on one or several lines
///
/// It knows no comment, tag, anchor, directive or tab, and nothing but ASCII. Whatever it isn't sure of, be
/// it wrong or only unusual, it leaves to the library's parser, so that this alone decides what a document
/// means. For what it accepts the tree is the one that the parser's events give, with the same hashes and
/// lines.
///
/// What becomes of a document is the builder's business: BatchedBuilder makes a tree of it.
///
/// One reader serves any number of documents, on one thread at a time.
template <class Builder> class WrittenFormReader {
public:
    struct Document {
        /// What the builder made of it, with header data behind the body. Null: not sure.
        typename Builder::Object object{};
        /// The writer would write the object as these very bytes.
        bool isAsWritten = false;
    };

    /// Everything in front of `readableEnd` may be read, from the document under way on.
    explicit WrittenFormReader(const char* readableEnd) : m_ReadableEnd(readableEnd) {}
    void SetReadableEnd(const char* readableEnd) { m_ReadableEnd = readableEnd; }

    /// `text` reaches from the "---" of the document up to that of the next or to the end of the file; it
    /// must stay up to the next InternTexts. `firstLine` is the zero-based line of the "---".
    Document Read(std::string_view text, std::uint32_t firstLine);
    Builder& TheBuilder() { return m_Form.builder; }
    /// Completes the objects read so far. Better for many of them than for each.
    void InternTexts();

private:
    struct Header {
        std::string_view classID;
        std::string_view fileID;
        bool isStripped;
    };

    std::string_view Readable(std::string_view text);
    typename Builder::Object ReadObject(std::uint32_t firstLine);
    Header ReadHeaderLine();
    std::string_view ReadId();
    std::size_t AddHeaderData(const Header& header);

    // Block style. Each function begins at the first character of its node and ends at that of the next line
    // that is not its own. `parent` is the key that a value stands under.

    void ReadMapping(int indent, KnownKey& parent);
    void ReadPairs(int indent, KnownKey& parent);
    KnownKey* GuessKey(KeyGuess& guess) const;
    KnownKey& ReadKey(const KnownKey& parent, KeyGuess& guess);
    void ReadValue(int indent, KnownKey& parent);
    void ReadSequence(int indent, KnownKey& parent);
    void ReadItem(int indent, KnownKey& parent);
    void ReadInline(int indent, KnownKey& parent);
    void ReadPlainText(int indent);
    std::string_view ReadPlainLine();
    void ReadFoldedText(int indent, std::string_view firstLine, std::size_t width);

    /// Longer documents are left to the library. What one of this size holds can be counted in any type that
    /// is in use here.
    static constexpr std::size_t kLongestDocument = INT32_MAX;

    /// Bytes behind a document that must be readable: what is compared or tested at one go.
    static constexpr std::size_t kReadableBehind = 160;
    static_assert(kReadableBehind >= KnownKey::kLongest + 2);
    static_assert(kReadableBehind >= Builder::kReadAhead);
    static_assert(kReadableBehind >= kScanAhead);

    const char* m_ReadableEnd;
    FormReading<Builder> m_Form;
    FlowReader<Builder> m_Flow{m_Form};
    std::deque<std::string> m_Copies; // of documents at the end of what may be read
    std::string m_FoldedText;         // of a scalar that stands on several lines
};

template <class Builder>
typename WrittenFormReader<Builder>::Document WrittenFormReader<Builder>::Read(std::string_view text,
                                                                               std::uint32_t firstLine) {
    Document document;
    if (text.empty() || text.size() > kLongestDocument || text.back() != '\n') return document;
    m_Form.Begin(Readable(text), firstLine);
    try {
        document.object = ReadObject(firstLine);
        document.isAsWritten = m_Form.notes.IsAsWritten();
    } catch (const NotSure&) {
        m_Form.builder.Clear();
    }
    return document;
}

/// The text where enough may be read behind it.
template <class Builder> std::string_view WrittenFormReader<Builder>::Readable(std::string_view text) {
    if (static_cast<std::size_t>(m_ReadableEnd - (text.data() + text.size())) >= kReadableBehind) return text;
    std::string& copy = m_Copies.emplace_back(text);
    copy.append(kReadableBehind, '\0');
    return std::string_view(copy).substr(0, text.size());
}

template <class Builder> void WrittenFormReader<Builder>::InternTexts() {
    m_Form.builder.InternTexts();
    m_Copies.clear();
}

template <class Builder>
typename Builder::Object WrittenFormReader<Builder>::ReadObject(std::uint32_t firstLine) {
    const Header header = ReadHeaderLine();
    if (m_Form.cursor.Indent() != 0) throw NotSure();
    ReadPairs(0, m_Form.keys.Root());
    if (!m_Form.cursor.IsAtEnd()) throw NotSure();
    const std::size_t headerPairs = AddHeaderData(header);
    m_Form.CloseMapping(0, false, firstLine, headerPairs);
    return m_Form.builder.TakeObject(header.isStripped);
}

template <class Builder>
typename WrittenFormReader<Builder>::Header WrittenFormReader<Builder>::ReadHeaderLine() {
    FormCursor& cursor = m_Form.cursor;
    Header header;
    if (!cursor.SkipIf(kDocumentStart)) throw NotSure();
    header.classID = ReadId();
    if (!cursor.SkipIf(kAnchor)) throw NotSure();
    header.fileID = ReadId();
    header.isStripped = cursor.SkipIf(kStripped);
    if (*cursor != '\n') throw NotSure();
    cursor.NextLine();
    return header;
}

template <class Builder> std::string_view WrittenFormReader<Builder>::ReadId() {
    const std::string_view id = IdAt(m_Form.cursor.Rest(), 0);
    if (id.empty()) throw NotSure();
    m_Form.cursor.Skip(static_cast<std::ptrdiff_t>(id.size()));
    return id;
}

/// The number of pairs.
template <class Builder> std::size_t WrittenFormReader<Builder>::AddHeaderData(const Header& header) {
    Builder& builder = m_Form.builder;
    builder.AddScalar(YAMLScalar::fileIDPlaceHolderName);
    builder.AddText(header.fileID);
    builder.AddScalar(YAMLScalar::classIDPlaceHolderName);
    builder.AddText(header.classID);
    if (!header.isStripped) return 2;
    builder.AddScalar(YAMLScalar::strippedPrefabPlaceHolderName);
    builder.AddScalar(YAMLScalar::one);
    return 3;
}

template <class Builder> void WrittenFormReader<Builder>::ReadMapping(int indent, KnownKey& parent) {
    const Nesting nesting(m_Form.depth);
    const std::size_t mark = m_Form.builder.Mark();
    const std::uint32_t line = m_Form.cursor.Line();
    ReadPairs(indent, parent);
    m_Form.CloseMapping(mark, false, line);
}

template <class Builder> void WrittenFormReader<Builder>::ReadPairs(int indent, KnownKey& parent) {
    KeyGuess* guess = &parent.inside;
    do {
        KnownKey& key = ReadKey(parent, *guess);
        ReadValue(indent, key);
        guess = &key.next;
    } while (m_Form.cursor.Indent() == indent);
}

/// The key here, if it is one of those that are expected.
template <class Builder> inline KnownKey* WrittenFormReader<Builder>::GuessKey(KeyGuess& guess) const {
    const FormCursor& cursor = m_Form.cursor;
    KnownKey* known = KnownKeys::Find(guess, cursor.Position());
    if (!known) return nullptr;
    const char behind = cursor[known->length + 1];
    return behind == ' ' || behind == '\n' ? known : nullptr;
}

/// Ends behind the colon.
template <class Builder>
KnownKey& WrittenFormReader<Builder>::ReadKey(const KnownKey& parent, KeyGuess& guess) {
    FormCursor& cursor = m_Form.cursor;
    if (KnownKey* known = GuessKey(guess)) {
        m_Form.builder.AddNode(known->scalar, known->hash);
        cursor.Skip(known->length + 1);
        return *known;
    }
    if (!IsPlainStart(*cursor)) throw NotSure();
    const char* end = ScanPlain(cursor.Position());
    if (*end != ':' || end - cursor.Position() > m_Form.kLongestKey) throw NotSure();
    return m_Form.AddKey(end, parent, guess);
}

template <class Builder> void WrittenFormReader<Builder>::ReadValue(int indent, KnownKey& parent) {
    FormCursor& cursor = m_Form.cursor;
    const bool hasBlank = *cursor == ' ';
    if (hasBlank) {
        cursor.Skip();
        if (*cursor != '\n') return ReadInline(indent, parent);
    }
    cursor.NextLine();
    const bool isList = cursor.Indent() == indent && cursor.IsAtListItem();
    const bool isEmpty = cursor.Indent() <= indent && !isList;
    m_Form.notes.NoteIf(hasBlank != isEmpty);
    if (isList)
        ReadSequence(indent, parent);
    else if (isEmpty)
        m_Form.builder.AddScalar(YAMLScalar::empty);
    else if (cursor.Indent() == indent + kIndentStep && !cursor.IsAtListItem())
        ReadMapping(cursor.Indent(), parent);
    else
        throw NotSure();
}

template <class Builder> void WrittenFormReader<Builder>::ReadSequence(int indent, KnownKey& parent) {
    const Nesting nesting(m_Form.depth);
    const std::size_t mark = m_Form.builder.Mark();
    const std::uint32_t line = m_Form.cursor.Line();
    do {
        ReadItem(indent, parent);
    } while (m_Form.cursor.Indent() == indent && m_Form.cursor.IsAtListItem());
    m_Form.builder.CloseSequence(mark, false, line);
}

template <class Builder> void WrittenFormReader<Builder>::ReadItem(int indent, KnownKey& parent) {
    FormCursor& cursor = m_Form.cursor;
    cursor.Skip();
    const bool hasBlank = *cursor == ' ';
    if (hasBlank) cursor.Skip();
    if (hasBlank && *cursor != '\n') {
        cursor.SetIndent(indent + kIndentStep);
        if (cursor.IsAtListItem()) return ReadSequence(cursor.Indent(), parent);
        const bool isGuessed = GuessKey(parent.inside);
        if (isGuessed || (IsPlainStart(*cursor) && *ScanPlain(cursor.Position()) == ':'))
            return ReadMapping(cursor.Indent(), parent);
        return ReadInline(indent, parent);
    }
    cursor.NextLine();
    if (cursor.Indent() > indent) throw NotSure();
    m_Form.notes.NoteIf(!hasBlank);
    m_Form.builder.AddScalar(YAMLScalar::empty);
}

/// A value that begins on the line of its key or dash. What is further in than `indent` continues it.
template <class Builder> void WrittenFormReader<Builder>::ReadInline(int indent, KnownKey& parent) {
    FormCursor& cursor = m_Form.cursor;
    const char first = *cursor;
    if (first == '{' || first == '[') {
        m_Flow.Read(indent, parent);
    } else if (first == '\'' || first == '"') {
        m_Form.AddQuoted({false, indent + kIndentStep});
    } else {
        ReadPlainText(indent);
        return;
    }
    if (*cursor != '\n') throw NotSure();
    cursor.NextLine();
    if (cursor.Indent() > indent) throw NotSure();
}

template <class Builder> void WrittenFormReader<Builder>::ReadPlainText(int indent) {
    FormCursor& cursor = m_Form.cursor;
    const bool isNegative = *cursor == '-' && IsPlain(cursor[1]);
    if (!IsPlainStart(*cursor) && !isNegative) throw NotSure();
    const std::string_view text = ReadPlainLine();
    const std::size_t width = cursor.Column();
    cursor.NextLine();
    if (cursor.Indent() <= indent) return m_Form.builder.AddText(text);
    ReadFoldedText(indent, text, width);
}

/// The part of a plain text that stands on this line. Ends at the line end.
template <class Builder> inline std::string_view WrittenFormReader<Builder>::ReadPlainLine() {
    FormCursor& cursor = m_Form.cursor;
    const char* begin = cursor.Position();
    const char* end = ScanPlain(begin);
    if (*end != '\n') throw NotSure();
    m_Form.notes.NoteText({begin, end}, cursor.LineStart());
    cursor.MoveTo(end);
    return {begin, end};
}

/// Behind the first line of a plain text, which is `width` columns wide. A line end is a blank.
template <class Builder>
void WrittenFormReader<Builder>::ReadFoldedText(int indent, std::string_view firstLine, std::size_t width) {
    FormCursor& cursor = m_Form.cursor;
    m_FoldedText = firstLine;
    while (cursor.Indent() > indent) {
        m_Form.notes.NoteIf(width <= kLineWidth || cursor.Indent() != indent + kIndentStep);
        if (*cursor == '#') throw NotSure();
        m_FoldedText.append(1, ' ').append(ReadPlainLine());
        width = cursor.Column();
        cursor.NextLine();
    }
    m_Form.builder.AddPassingText(m_FoldedText);
}

} // namespace ovrin_yaml
