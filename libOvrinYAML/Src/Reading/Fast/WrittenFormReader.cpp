#include "Reading/Fast/WrittenFormReader.h"

#include "Values/YAMLScalar.h"

namespace ovrin_yaml {

namespace {

/// Longer documents are left to the library. What one of this size holds can be counted in any type that is
/// in use here.
constexpr std::size_t kLongestDocument = INT32_MAX;

/// Bytes behind a document that must be readable: what is compared or tested at one go.
constexpr std::size_t kReadAhead = 160;
static_assert(kReadAhead >= KnownKey::kLongest + 2);
static_assert(kReadAhead >= BatchedBuilder::kReadAhead);
static_assert(kReadAhead >= kScanAhead);

} // namespace

WrittenFormReader::Document WrittenFormReader::Read(std::string_view text, std::uint32_t firstLine) {
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
std::string_view WrittenFormReader::Readable(std::string_view text) {
    if (static_cast<std::size_t>(m_ReadableEnd - (text.data() + text.size())) >= kReadAhead) return text;
    std::string& copy = m_Copies.emplace_back(text);
    copy.append(kReadAhead, '\0');
    return std::string_view(copy).substr(0, text.size());
}

void WrittenFormReader::InternTexts() {
    m_Form.builder.InternTexts();
    m_Copies.clear();
}

YAMLMapping* WrittenFormReader::ReadObject(std::uint32_t firstLine) {
    const Header header = ReadHeaderLine();
    if (m_Form.cursor.Indent() != 0) throw NotSure();
    ReadPairs(0, m_Form.keys.Root());
    if (!m_Form.cursor.IsAtEnd()) throw NotSure();
    const std::size_t headerPairs = AddHeaderData(header);
    m_Form.CloseMapping(0, false, firstLine, headerPairs);
    YAMLMapping* object = AsMapping(m_Form.builder.TakeRoot());
    // A body's own entry would be taken for the header's. Its value may still be missing, so only the key can
    // be asked for.
    const bool hasMark = object->FindKey(YAMLScalar::strippedPrefabPlaceHolderName) != object->end();
    if (hasMark && !header.isStripped) throw NotSure();
    return object;
}

WrittenFormReader::Header WrittenFormReader::ReadHeaderLine() {
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

std::string_view WrittenFormReader::ReadId() {
    const std::string_view id = IdAt(m_Form.cursor.Rest(), 0);
    if (id.empty()) throw NotSure();
    m_Form.cursor.Skip(static_cast<std::ptrdiff_t>(id.size()));
    return id;
}

/// The number of pairs.
std::size_t WrittenFormReader::AddHeaderData(const Header& header) {
    BatchedBuilder& builder = m_Form.builder;
    builder.AddScalar(YAMLScalar::fileIDPlaceHolderName);
    builder.AddText(header.fileID);
    builder.AddScalar(YAMLScalar::classIDPlaceHolderName);
    builder.AddText(header.classID);
    if (!header.isStripped) return 2;
    builder.AddScalar(YAMLScalar::strippedPrefabPlaceHolderName);
    builder.AddScalar(YAMLScalar::one);
    return 3;
}

void WrittenFormReader::ReadMapping(int indent, KnownKey& parent) {
    const Nesting nesting(m_Form);
    const std::size_t mark = m_Form.builder.Mark();
    const std::uint32_t line = m_Form.cursor.Line();
    ReadPairs(indent, parent);
    m_Form.CloseMapping(mark, false, line);
}

void WrittenFormReader::ReadPairs(int indent, KnownKey& parent) {
    KeyGuess* guess = &parent.inside;
    do {
        KnownKey& key = ReadKey(parent, *guess);
        ReadValue(indent, key);
        guess = &key.next;
    } while (m_Form.cursor.Indent() == indent);
}

/// The key here, if it is one of those that are expected.
inline KnownKey* WrittenFormReader::GuessKey(KeyGuess& guess) const {
    const FormCursor& cursor = m_Form.cursor;
    KnownKey* known = KnownKeys::Find(guess, cursor.Position());
    if (!known) return nullptr;
    const char behind = cursor[known->length + 1];
    return behind == ' ' || behind == '\n' ? known : nullptr;
}

/// Ends behind the colon.
KnownKey& WrittenFormReader::ReadKey(const KnownKey& parent, KeyGuess& guess) {
    FormCursor& cursor = m_Form.cursor;
    if (KnownKey* known = GuessKey(guess)) {
        m_Form.builder.AddNode(known->scalar, known->hash);
        cursor.Skip(known->length + 1);
        return *known;
    }
    if (!IsPlainStart(*cursor)) throw NotSure();
    const char* end = ScanPlain(cursor.Position());
    if (*end != ':' || end - cursor.Position() > FormReading::kLongestKey) throw NotSure();
    return m_Form.AddKey(end, parent, guess);
}

void WrittenFormReader::ReadValue(int indent, KnownKey& parent) {
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

void WrittenFormReader::ReadSequence(int indent, KnownKey& parent) {
    const Nesting nesting(m_Form);
    const std::size_t mark = m_Form.builder.Mark();
    const std::uint32_t line = m_Form.cursor.Line();
    do {
        ReadItem(indent, parent);
    } while (m_Form.cursor.Indent() == indent && m_Form.cursor.IsAtListItem());
    m_Form.builder.CloseSequence(mark, false, line);
}

void WrittenFormReader::ReadItem(int indent, KnownKey& parent) {
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
void WrittenFormReader::ReadInline(int indent, KnownKey& parent) {
    FormCursor& cursor = m_Form.cursor;
    const char first = *cursor;
    if (first == '{' || first == '[') {
        m_Flow.Read(indent, parent);
    } else if (first == '\'' || first == '"') {
        m_Form.AddQuoted(false);
    } else {
        ReadPlainText(indent);
        return;
    }
    if (*cursor != '\n') throw NotSure();
    cursor.NextLine();
    if (cursor.Indent() > indent) throw NotSure();
}

void WrittenFormReader::ReadPlainText(int indent) {
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
inline std::string_view WrittenFormReader::ReadPlainLine() {
    FormCursor& cursor = m_Form.cursor;
    const char* begin = cursor.Position();
    const char* end = ScanPlain(begin);
    if (*end != '\n') throw NotSure();
    m_Form.notes.NoteText({begin, end}, cursor.LineStart());
    cursor.MoveTo(end);
    return {begin, end};
}

/// Behind the first line of a plain text, which is `width` columns wide. A line end is a blank.
void WrittenFormReader::ReadFoldedText(int indent, std::string_view firstLine, std::size_t width) {
    FormCursor& cursor = m_Form.cursor;
    m_FoldedText = firstLine;
    while (cursor.Indent() > indent) {
        m_Form.notes.NoteIf(width <= kLineWidth || cursor.Indent() != indent + kIndentStep);
        if (*cursor == '#') throw NotSure();
        m_FoldedText.append(1, ' ').append(ReadPlainLine());
        width = cursor.Column();
        cursor.NextLine();
    }
    m_Form.builder.AddScalar(YAMLScalar::Lookup(m_FoldedText));
}

} // namespace ovrin_yaml
