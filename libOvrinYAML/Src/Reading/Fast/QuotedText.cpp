#include "Reading/Fast/QuotedText.h"

#include "Writing/ScalarWriter.h"
#include "Writing/WrittenForm.h"

namespace ovrin_yaml {

namespace {

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

/// The value of a hexadecimal digit, or -1.
int DigitOf(char c) {
    if (c >= '0' && c <= '9') return c - '0';
    if (c >= 'A' && c <= 'F') return c - 'A' + 10;
    if (c >= 'a' && c <= 'f') return c - 'a' + 10;
    return -1;
}

} // namespace

std::string_view QuotedText::Read(QuotedPlace place) {
    const char quote = *m_Cursor;
    const std::size_t column = m_Cursor.Column();
    m_Cursor.Skip();
    const char* begin = m_Cursor.Position();
    const char* p = begin;
    const char other = quote == '"' ? '\'' : '"';
    while (IsPlainInQuotes(*p) || *p == other) ++p;
    if (*p != quote || (quote == '\'' && p[1] == '\'')) {
        ReadPieces(p);
        NotePieces(begin - 1, column, place);
        return m_Text;
    }
    const std::string_view text(begin, p);
    m_Notes.NoteQuoted(quote, text, place.inFlow, m_Cursor.LineStart());
    m_Cursor.MoveTo(p + 1);
    return text;
}

/// Up to `from` the text stands for itself, unless it ends in blanks: these are looked at again.
void QuotedText::ReadPieces(const char* from) {
    const char* begin = m_Cursor.Position();
    const char quote = begin[-1];
    while (from != begin && from[-1] == ' ') --from;
    m_Text.assign(begin, from);
    m_Cursor.MoveTo(from);
    for (;;) {
        const char c = *m_Cursor;
        if (c == quote && !(quote == '\'' && m_Cursor[1] == '\'')) break;
        if (c == ' ' || c == '\n') {
            FoldLines();
        } else if (c == '\\' && quote == '"') {
            Unescape();
        } else if (IsPrintable(c)) {
            m_Text += c;
            m_Cursor.Skip(c == quote ? 2 : 1);
        } else {
            throw NotSure();
        }
    }
    m_Cursor.Skip();
}

/// What was read of pieces from the quote at `begin` on is written again to be compared: where a line breaks
/// and what is escaped follows from many rules. Of keys few are as written, so that isn't worth the while.
void QuotedText::NotePieces(const char* begin, std::size_t column, QuotedPlace place) {
    if (place.foldIndent == QuotedPlace::kKey || !m_Notes.IsAsWritten()) return m_Notes.NoteIf(true);
    const ScalarForms forms = ClassifyScalar(m_Text);
    m_Written.clear();
    TextOutput output(m_Written, column);
    WriteScalar(output, m_Text, forms, place.inFlow ? forms.plainInFlow : forms.plainInBlock,
                {true, place.foldIndent});
    output.Finish();
    m_Notes.NoteIf(m_Written != std::string_view(begin, m_Cursor.Position()));
}

/// Blanks inside a line stand for themselves. Around line ends they count for nothing: one line end is a
/// blank, and of several the first counts for nothing either.
void QuotedText::FoldLines() {
    const char* blanks = m_Cursor.Position();
    while (*m_Cursor == ' ') m_Cursor.Skip();
    if (*m_Cursor != '\n') {
        m_Text.append(blanks, m_Cursor.Position());
        return;
    }
    std::size_t lineEnds = 0;
    while (*m_Cursor == '\n') {
        ++lineEnds;
        m_Cursor.SkipLineEnd();
        if (m_Cursor.IsAtEnd()) throw NotSure();
        while (*m_Cursor == ' ') m_Cursor.Skip();
    }
    // At the first column three dashes or dots would end the document.
    if (m_Cursor.Column() == 0) throw NotSure();
    if (lineEnds == 1)
        m_Text += ' ';
    else
        m_Text.append(lineEnds - 1, '\n');
}

void QuotedText::Unescape() {
    const char letter = m_Cursor[1];
    m_Cursor.Skip(2);
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

std::uint32_t QuotedText::ReadHex(int digits) {
    std::uint32_t value = 0;
    for (; digits > 0; --digits) {
        const int digit = DigitOf(*m_Cursor);
        if (digit < 0) throw NotSure();
        value = value << 4 | static_cast<std::uint32_t>(digit);
        m_Cursor.Skip();
    }
    if ((value >= 0xd800 && value <= 0xdfff) || value > 0x10ffff) throw NotSure();
    return value;
}

} // namespace ovrin_yaml
