#include "Reading/Fast/WrittenFormReader.h"

#include "Values/YAMLScalar.h"
#include "Writing/ScalarStyle.h"
#include "Writing/WrittenForm.h"

#include <algorithm>
#include <bit>
#include <cstring>

namespace ovrin_yaml {

namespace {

/// Deeper and longer documents are left to the library, which has the limits; its own depth is a little more.
/// What a document of this size holds can be counted in any type that is in use here.
constexpr int kSafeDepth = 990;
constexpr std::size_t kLongestDocument = INT32_MAX;
/// The parser looks for the colon behind a key within 1024 characters.
constexpr std::ptrdiff_t kLongestKey = 1000;
static_assert(kLongestSimpleKey <= KnownKey::kLongest);

/// Bytes behind a document that must be readable: what is compared or tested at one go.
constexpr std::ptrdiff_t kReadAhead = 160;
static_assert(kReadAhead >= static_cast<std::ptrdiff_t>(KnownKey::kLongest + 2));
static_assert(kReadAhead >= static_cast<std::ptrdiff_t>(BatchedBuilder::kReadAhead));

constexpr std::uint64_t EachByte(std::uint64_t byte) {
    return byte * 0x0101010101010101u;
}

/// The lowest bits of the eight bytes, side by side: the factor moves each of them to its place in the top
/// byte.
std::uint64_t BitOfEachByte(std::uint64_t bytes) {
    return (bytes & EachByte(1)) * 0x0102040810204080u >> 56;
}

/// Letters, digits and "-./_" are most of what stands in a scene, and plain in both styles wherever they
/// don't begin a text.
const char* SkipWord(const char* p) {
    using Bytes [[gnu::vector_size(16)]] = std::uint8_t;
    constexpr std::uint8_t kFirst = '-', kSpan = '9' - '-', kLetter = 'a', kLetters = 'z' - 'a';
    constexpr std::uint8_t kCase = 0x20, kUnderscore = '_';
    for (;; p += sizeof(Bytes)) {
        Bytes bytes;
        std::memcpy(&bytes, p, sizeof bytes);
        // Ranges begin at zero, so that one comparison tells what is in them.
        const auto others =
            ~((bytes - kFirst <= kSpan) | ((bytes | kCase) - kLetter <= kLetters) | (bytes == kUnderscore));
        std::uint64_t halves[2];
        std::memcpy(halves, &others, sizeof halves);
        // Where a word ends is hard to foretell, so both halves are looked at without a branch.
        const std::uint64_t bits = BitOfEachByte(halves[0]) | BitOfEachByte(halves[1]) << 8;
        if (bits) return p + std::countr_zero(bits);
    }
}

const char* SkipBlanks(const char* p) {
    for (;; p += 8)
        if (const std::uint64_t others = KnownKey::Load(p) ^ EachByte(' '))
            return p + std::countr_zero(others) / 8;
}

/// Whether the writer gives a plain or quoted key this form.
bool IsKeyAsWritten(std::string_view text) {
    return !IsLikeMark(text) && !text.ends_with(':') && text.size() <= kLongestSimpleKey;
}

void AppendUTF8(std::string& text, std::uint32_t c) {
    const auto put = [&text](std::uint32_t byte) { text += static_cast<char>(byte); };
    if (c < 0x80) {
        put(c);
        return;
    }
    if (c < 0x800) {
        put(0xc0 | c >> 6);
    } else if (c < 0x10000) {
        put(0xe0 | c >> 12);
        put(0x80 | (c >> 6 & 0x3f));
    } else {
        put(0xf0 | c >> 18);
        put(0x80 | (c >> 12 & 0x3f));
        put(0x80 | (c >> 6 & 0x3f));
    }
    put(0x80 | (c & 0x3f));
}

} // namespace

/// Counts the open collections.
class WrittenFormReader::Nesting {
public:
    explicit Nesting(WrittenFormReader& reader) : m_Reader(reader) {
        if (++m_Reader.m_Depth > kSafeDepth) throw NotSure();
    }
    ~Nesting() { --m_Reader.m_Depth; }

private:
    WrittenFormReader& m_Reader;
};

WrittenFormReader::Document WrittenFormReader::Read(std::string_view text, std::uint32_t firstLine) {
    Document document;
    if (text.empty() || text.size() > kLongestDocument || text.back() != '\n') return document;
    Begin(text, firstLine);
    try {
        document.object = ReadObject(firstLine);
        document.isAsWritten = m_IsAsWritten;
    } catch (const NotSure&) {
        m_Builder.Clear();
    }
    return document;
}

void WrittenFormReader::Begin(std::string_view text, std::uint32_t firstLine) {
    if (m_ReadableEnd - (text.data() + text.size()) < kReadAhead) {
        std::string& copy = m_Copies.emplace_back(text);
        copy.append(kReadAhead, '\0');
        text = std::string_view(copy).substr(0, text.size());
    }
    m_Position = text.data();
    m_End = m_Position + text.size();
    m_LineStart = m_Position;
    m_Line = firstLine;
    m_Depth = 0;
    m_IsAsWritten = true;
}

void WrittenFormReader::InternTexts() {
    m_Builder.InternTexts();
    m_Copies.clear();
}

YAMLMapping* WrittenFormReader::ReadObject(std::uint32_t firstLine) {
    const Header header = ReadHeaderLine();
    if (m_Indent != 0) throw NotSure();
    ReadPairs(0, m_KnownKeys.Root());
    if (m_Indent != -1) throw NotSure();
    const std::size_t headerPairs = AddHeaderData(header);
    CloseMapping(0, false, firstLine, headerPairs);
    YAMLMapping* object = AsMapping(m_Builder.TakeRoot());
    // A body's own entry would be taken for the header's. Its value may still be missing, so only the key can
    // be asked for.
    const bool hasMark = object->FindKey(YAMLScalar::strippedPrefabPlaceHolderName) != object->end();
    if (hasMark && !header.isStripped) throw NotSure();
    return object;
}

WrittenFormReader::Header WrittenFormReader::ReadHeaderLine() {
    const auto skip = [this](std::string_view text) {
        if (!std::string_view(m_Position, m_End - m_Position).starts_with(text)) return false;
        m_Position += text.size();
        return true;
    };
    Header header;
    if (!skip(kDocumentStart)) throw NotSure();
    header.classID = ReadId();
    if (!skip(kAnchor)) throw NotSure();
    header.fileID = ReadId();
    header.isStripped = skip(kStripped);
    if (*m_Position != '\n') throw NotSure();
    NextLine();
    return header;
}

/// The number of pairs.
std::size_t WrittenFormReader::AddHeaderData(const Header& header) {
    m_Builder.AddScalar(YAMLScalar::fileIDPlaceHolderName);
    m_Builder.AddText(header.fileID);
    m_Builder.AddScalar(YAMLScalar::classIDPlaceHolderName);
    m_Builder.AddText(header.classID);
    if (!header.isStripped) return 2;
    m_Builder.AddScalar(YAMLScalar::strippedPrefabPlaceHolderName);
    m_Builder.AddScalar(YAMLScalar::one);
    return 3;
}

/// A mapping that repeats a key is left to the library's path.
void WrittenFormReader::CloseMapping(std::size_t mark, bool flow, std::uint32_t line, std::size_t unhashed) {
    if (!m_Builder.CloseMapping(mark, flow, line, unhashed)) throw NotSure();
}

std::string_view WrittenFormReader::ReadId() {
    const std::string_view id = IdAt({m_Position, m_End}, 0);
    if (id.empty()) throw NotSure();
    m_Position += id.size();
    return id;
}

/// From the end of a line to the first character of the next that is no blank.
void WrittenFormReader::NextLine() {
    const char* line = ++m_Position;
    m_LineStart = line;
    ++m_Line;
    if (line == m_End) {
        m_Indent = -1;
        return;
    }
    m_Position = SkipBlanks(line);
    m_Indent = static_cast<int>(m_Position - line);
    if (*m_Position == '\n') throw NotSure();
    // At the first column three dashes or dots would end the document.
    if (m_Indent == 0 && (*line == '.' || (*line == '-' && line[1] == '-'))) throw NotSure();
}

bool WrittenFormReader::AtListItem() const {
    return *m_Position == '-' && (m_Position[1] == ' ' || m_Position[1] == '\n');
}

// Block style. Each function begins at the first character of its node and ends at that of the next line that
// is not its own, with m_Indent set.

void WrittenFormReader::ReadBlockMapping(int indent, KnownKey& parent) {
    const Nesting nesting(*this);
    const std::size_t mark = m_Builder.Mark();
    const std::uint32_t line = m_Line;
    ReadPairs(indent, parent);
    CloseMapping(mark, false, line);
}

void WrittenFormReader::ReadPairs(int indent, KnownKey& parent) {
    KeyGuess* guess = &parent.inside;
    do {
        KnownKey& key = ReadBlockKey(parent, *guess);
        ReadBlockValue(indent, key);
        guess = &key.next;
    } while (m_Indent == indent);
}

/// The key here, if it is one of those that are expected.
inline KnownKey* WrittenFormReader::GuessBlockKey(KeyGuess& guess) const {
    KnownKey* known = KnownKeys::Find(guess, m_Position);
    if (!known) return nullptr;
    const char behind = m_Position[known->length + 1];
    return behind == ' ' || behind == '\n' ? known : nullptr;
}

/// Ends behind the colon.
KnownKey& WrittenFormReader::ReadBlockKey(const KnownKey& parent, KeyGuess& guess) {
    if (KnownKey* known = GuessBlockKey(guess)) {
        m_Builder.AddNode(known->scalar, known->hash);
        m_Position += known->length + 1;
        return *known;
    }
    if (!IsPlainStart(*m_Position)) throw NotSure();
    const char* end = ScanPlain(m_Position);
    if (*end != ':' || end - m_Position > kLongestKey) throw NotSure();
    return AddKey(end, parent, guess);
}

/// Adds a key that wasn't guessed. It can be guessed from now on if it is the same in any place, whatever
/// stands around it: plain in both styles, without blanks, and what the writer writes for it. Ends behind the
/// colon.
KnownKey& WrittenFormReader::AddKey(const char* end, const KnownKey& parent, KeyGuess& guess) {
    const std::string_view text(m_Position, static_cast<std::size_t>(end - m_Position));
    YAMLScalar* scalar = m_Builder.Intern(text);
    m_Builder.AddScalar(scalar);
    m_Position = end + 1;
    const bool isWritten = IsKeyAsWritten(text);
    NoteIf(!isWritten);
    const bool isSame = IsPlainStart(text[0]) &&
                        std::all_of(text.begin(), text.end(), [](char c) { return IsPlainInFlow(c); });
    return isWritten && isSame ? m_KnownKeys.Learn(parent, scalar, guess) : m_KnownKeys.Unknown();
}

void WrittenFormReader::ReadBlockValue(int indent, KnownKey& parent) {
    const bool hasBlank = *m_Position == ' ';
    if (hasBlank && *++m_Position != '\n') return ReadInline(indent, parent);
    NextLine();
    const bool isList = m_Indent == indent && AtListItem();
    const bool isEmpty = m_Indent <= indent && !isList;
    NoteIf(hasBlank != isEmpty);
    if (isList)
        ReadBlockSequence(indent, parent);
    else if (isEmpty)
        m_Builder.AddScalar(YAMLScalar::empty);
    else if (m_Indent == indent + kIndentStep && !AtListItem())
        ReadBlockMapping(m_Indent, parent);
    else
        throw NotSure();
}

void WrittenFormReader::ReadBlockSequence(int indent, KnownKey& parent) {
    const Nesting nesting(*this);
    const std::size_t mark = m_Builder.Mark();
    const std::uint32_t line = m_Line;
    do {
        ReadItem(indent, parent);
    } while (m_Indent == indent && AtListItem());
    m_Builder.CloseSequence(mark, false, line);
}

void WrittenFormReader::ReadItem(int indent, KnownKey& parent) {
    const bool hasBlank = *++m_Position == ' ';
    if (hasBlank && *++m_Position != '\n') {
        m_Indent = indent + kIndentStep;
        if (AtListItem()) return ReadBlockSequence(m_Indent, parent);
        const bool isGuessed = GuessBlockKey(parent.inside);
        if (isGuessed || (IsPlainStart(*m_Position) && *ScanPlain(m_Position) == ':'))
            return ReadBlockMapping(m_Indent, parent);
        return ReadInline(indent, parent);
    }
    NextLine();
    if (m_Indent > indent) throw NotSure();
    NoteIf(!hasBlank);
    m_Builder.AddScalar(YAMLScalar::empty);
}

/// A value that begins on the line of its key or dash. What is further in than `indent` continues it.
void WrittenFormReader::ReadInline(int indent, KnownKey& parent) {
    const char first = *m_Position;
    if (first == '{' || first == '[') {
        m_FlowIndent = indent;
        ReadFlow(parent);
    } else if (first == '\'' || first == '"') {
        AddQuoted(ReadQuoted(false));
    } else {
        ReadPlainLines(indent);
        return;
    }
    if (*m_Position != '\n') throw NotSure();
    NextLine();
    if (m_Indent > indent) throw NotSure();
}

/// The end of the plain text on this line: the line end, or a colon that ends a key.
const char* WrittenFormReader::ScanPlain(const char* from) const {
    for (const char* p = SkipWord(from);; p = SkipWord(p + 1)) {
        switch (*p) {
        case '\n':
            return p;
        case ':':
            if (p[1] != ' ' && p[1] != '\n') break;
            if (p[-1] == ' ') throw NotSure();
            return p;
        case ' ': // not before a comment, and not at an end, where the parser would drop it
            if (p[1] == '#' || p[1] == '\n') throw NotSure();
            break;
        case '#':
            break;
        default:
            if (!IsPlain(*p)) throw NotSure();
        }
    }
}

void WrittenFormReader::ReadPlainLines(int indent) {
    const bool isNegative = *m_Position == '-' && IsPlain(m_Position[1]);
    if (!IsPlainStart(*m_Position) && !isNegative) throw NotSure();
    const char* begin = m_Position;
    const char* end = ScanPlain(begin);
    if (*end != '\n') throw NotSure();
    NoteText(begin, end);
    std::size_t width = Column(end);
    m_Position = end;
    NextLine();
    if (m_Indent <= indent) return m_Builder.AddText({begin, end});
    m_Text.assign(begin, end);
    while (m_Indent > indent) {
        NoteIf(width <= kLineWidth || m_Indent != indent + kIndentStep);
        if (*m_Position == '#') throw NotSure();
        end = ScanPlain(m_Position);
        if (*end != '\n') throw NotSure();
        NoteText(m_Position, end);
        width = Column(end);
        m_Text.append(1, ' ').append(m_Position, end);
        m_Position = end;
        NextLine();
    }
    m_Builder.AddScalar(YAMLScalar::Lookup(m_Text));
}

/// A text that stands plain on this line: the writer breaks lines at blanks behind the width, and quotes what
/// could be taken for a document marker.
void WrittenFormReader::NoteText(const char* begin, const char* end) {
    if (begin[0] == begin[1] && (*begin == '-' || *begin == '.')) NoteIf(IsLikeMark({begin, end}));
    if (Column(end) > kLineWidth) NoteLongText(begin, end);
}

void WrittenFormReader::NoteLongText(const char* begin, const char* end) {
    const char* const behindWidth = std::max(begin, m_LineStart + kLineWidth + 1);
    NoteIf(behindWidth < end && std::memchr(behindWidth, ' ', static_cast<std::size_t>(end - behindWidth)));
}

// Flow style. Each function begins at the first character of its node and ends behind the last.

void WrittenFormReader::ReadFlow(KnownKey& parent) {
    const Nesting nesting(*this);
    m_FlowIndent += kIndentStep;
    if (*m_Position == '{')
        ReadFlowMapping(parent);
    else
        ReadFlowSequence(parent);
    m_FlowIndent -= kIndentStep;
}

void WrittenFormReader::ReadFlowMapping(KnownKey& parent) {
    const std::size_t mark = m_Builder.Mark();
    const std::uint32_t line = m_Line;
    if (*++m_Position == '}') {
        ++m_Position;
    } else {
        NoteIf(Column(m_Position) > kLineWidth);
        KeyGuess* guess = &parent.inside;
        do {
            KnownKey& key = ReadFlowKey(parent, *guess);
            ReadFlowValue(key);
            guess = &key.next;
        } while (SkipUsualSeparator() || ReadFlowSeparator('}'));
    }
    CloseMapping(mark, true, line);
}

/// Ends at the first character of the value.
KnownKey& WrittenFormReader::ReadFlowKey(const KnownKey& parent, KeyGuess& guess) {
    KnownKey* known = KnownKeys::Find(guess, m_Position);
    if (known && m_Position[known->length + 1] == ' ') {
        m_Builder.AddNode(known->scalar, known->hash);
        m_Position += known->length + 2;
        return *known;
    }
    const char* begin = m_Position;
    KnownKey* key = &m_KnownKeys.Unknown();
    if (*begin == '\'' || *begin == '"') {
        const std::uint32_t line = m_Line;
        m_Builder.AddScalar(YAMLScalar::Lookup(ReadQuoted(true)));
        if (m_Line != line) throw NotSure();
        NoteIf(!IsKeyAsWritten({begin, m_Position}));
        if (*m_Position++ != ':') throw NotSure();
    } else {
        const char* end = ScanFlowPlain();
        if (*end != ':') throw NotSure();
        key = &AddKey(end, parent, guess);
    }
    if (m_Position - begin > kLongestKey + 1 || *m_Position++ != ' ') throw NotSure();
    return *key;
}

void WrittenFormReader::ReadFlowSequence(KnownKey& parent) {
    const std::size_t mark = m_Builder.Mark();
    const std::uint32_t line = m_Line;
    if (*++m_Position == ']') {
        ++m_Position;
    } else {
        NoteIf(Column(m_Position) > kLineWidth);
        do {
            ReadFlowValue(parent);
        } while (SkipUsualSeparator() || ReadFlowSeparator(']'));
    }
    m_Builder.CloseSequence(mark, true, line);
}

void WrittenFormReader::ReadFlowValue(KnownKey& parent) {
    const char first = *m_Position;
    if (first == '{' || first == '[') {
        ReadFlow(parent);
    } else if (first == '\'' || first == '"') {
        AddQuoted(ReadQuoted(true));
    } else {
        const char* end = ScanFlowPlain();
        m_Builder.AddText({m_Position, end});
        m_Position = end;
    }
}

/// The same as ReadFlowSeparator for what nearly always stands there.
inline bool WrittenFormReader::SkipUsualSeparator() {
    if (m_Position[0] != ',' || m_Position[1] != ' ' || Column(m_Position) >= kLineWidth) return false;
    m_Position += 2;
    return true;
}

/// Behind an entry: true at the first character of the next, false behind the closing bracket.
bool WrittenFormReader::ReadFlowSeparator(char close) {
    if (*m_Position == close) {
        ++m_Position;
        return false;
    }
    if (*m_Position != ',') throw NotSure();
    const bool isFull = Column(++m_Position) > kLineWidth;
    if (*m_Position == ' ') {
        NoteIf(isFull);
        ++m_Position;
        return true;
    }
    if (*m_Position != '\n') throw NotSure();
    NextLine();
    if (m_Indent < 1) throw NotSure();
    NoteIf(!isFull || m_Indent != m_FlowIndent);
    return true;
}

/// The end of the plain text. A blank, a line end or a sign that has a meaning of its own is met by the
/// caller, who wants none of them.
const char* WrittenFormReader::ScanFlowPlain() {
    const char* p = m_Position;
    if (!IsPlainStart(*p) && !(*p == '-' && IsPlainInFlow(p[1]))) throw NotSure();
    p = SkipWord(p);
    while (IsPlainInFlow(*p) || (*p == ' ' && IsPlainInFlow(p[1]))) p = SkipWord(p + 1);
    NoteText(m_Position, p);
    return p;
}

// Quoted texts.

void WrittenFormReader::AddQuoted(std::string_view text) {
    // A text in m_Text will not stay.
    if (text.data() == m_Text.data())
        m_Builder.AddScalar(YAMLScalar::Lookup(text));
    else
        m_Builder.AddText(text);
}

/// The text, which stands in the document or in m_Text.
std::string_view WrittenFormReader::ReadQuoted(bool inFlow) {
    const char quote = *m_Position++;
    const char* p = m_Position;
    const char other = quote == '"' ? '\'' : '"';
    while (IsPlainInQuotes(*p) || *p == other) ++p;
    if (*p != quote || (quote == '\'' && p[1] == '\'')) return ReadQuotedWithFolds(p);
    const std::string_view text(m_Position, static_cast<std::size_t>(p - m_Position));
    NoteText(m_Position, p);
    const ScalarForms forms = ClassifyScalar(text);
    NoteIf(quote != '\'' || !forms.singleQuoted || (inFlow ? forms.plainInFlow : forms.plainInBlock));
    m_Position = p + 1;
    return text;
}

/// Up to `from` the text stands for itself, unless it ends in blanks: these are looked at again.
std::string_view WrittenFormReader::ReadQuotedWithFolds(const char* from) {
    m_IsAsWritten = false;
    const char quote = m_Position[-1];
    while (from != m_Position && from[-1] == ' ') --from;
    m_Text.assign(m_Position, from);
    m_Position = from;
    for (;;) {
        const char c = *m_Position;
        if (c == quote && !(quote == '\'' && m_Position[1] == '\'')) break;
        if (c == ' ' || c == '\n') {
            FoldLines();
        } else if (c == '\\' && quote == '"') {
            Unescape();
        } else if (c > ' ' && c < 0x7f) {
            m_Text += c;
            m_Position += c == quote ? 2 : 1;
        } else {
            throw NotSure();
        }
    }
    ++m_Position;
    return m_Text;
}

/// Blanks inside a line stand for themselves. Around line ends they count for nothing: one line end is a
/// blank, and of several the first counts for nothing either.
void WrittenFormReader::FoldLines() {
    const char* blanks = m_Position;
    while (*m_Position == ' ') ++m_Position;
    if (*m_Position != '\n') {
        m_Text.append(blanks, m_Position);
        return;
    }
    std::size_t lineEnds = 0;
    const char* line = m_Position;
    while (*m_Position == '\n') {
        ++lineEnds;
        ++m_Line;
        m_LineStart = line = ++m_Position;
        if (line == m_End) throw NotSure();
        while (*m_Position == ' ') ++m_Position;
    }
    // At the first column three dashes or dots would end the document.
    if (m_Position == line) throw NotSure();
    if (lineEnds == 1)
        m_Text += ' ';
    else
        m_Text.append(lineEnds - 1, '\n');
}

void WrittenFormReader::Unescape() {
    const char letter = m_Position[1];
    m_Position += 2;
    if (letter == ' ') {
        m_Text += ' ';
        return;
    }
    for (const LetterEscape& escape : kLetterEscapes)
        if (escape.letter == letter) return AppendUTF8(m_Text, escape.character);
    for (const NumberEscape& escape : kNumberEscapes)
        if (escape.letter == letter) return AppendUTF8(m_Text, ReadHex(escape.digits));
    throw NotSure();
}

std::uint32_t WrittenFormReader::ReadHex(int digits) {
    std::uint32_t value = 0;
    for (; digits > 0; --digits) {
        const char c = *m_Position;
        const int digit = c >= '0' && c <= '9'   ? c - '0'
                          : c >= 'A' && c <= 'F' ? c - 'A' + 10
                          : c >= 'a' && c <= 'f' ? c - 'a' + 10
                                                 : -1;
        if (digit < 0) throw NotSure();
        value = value << 4 | static_cast<std::uint32_t>(digit);
        ++m_Position;
    }
    if ((value >= 0xd800 && value <= 0xdfff) || value > 0x10ffff) throw NotSure();
    return value;
}

} // namespace ovrin_yaml
