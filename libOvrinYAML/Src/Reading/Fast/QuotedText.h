#pragma once

#include "Reading/Fast/FormCursor.h"
#include "Reading/Fast/FormNotes.h"

#include <cstdint>
#include <string>
#include <string_view>

namespace ovrin_yaml {

/// Where a quoted text stands, as far as the writer's choices depend on it.
struct QuotedPlace {
    static constexpr int kKey = -1;

    bool inFlow;
    int foldIndent; ///< of the lines that it is spread over, or kKey
};

/// Reads texts between quotes.
///
///     'a: b'         a: b        most stand for themselves, and are not copied
///     'it''s'        it's        a quote inside is doubled
///     "tab\t\x01"                between double quotes there are escapes
///     'one           one two     a line end counts as a blank, with the blanks around it; of several line
///       two'                     ends the first counts for nothing
class QuotedText {
public:
    /// Reads at `cursor` and notes what it sees of the form; both must outlive this.
    QuotedText(FormCursor& cursor, FormNotes& notes) : m_Cursor(cursor), m_Notes(notes) {}
    QuotedText(const QuotedText&) = delete;
    QuotedText& operator=(const QuotedText&) = delete;

    /// The text whose opening quote stands here; ends behind the closing one. It stands in the document, or
    /// here up to the next reading.
    std::string_view Read(QuotedPlace place);
    bool Holds(std::string_view text) const { return text.data() == m_Text.data(); }

private:
    void ReadPieces(const char* from);
    void NotePieces(const char* begin, std::size_t column, QuotedPlace place);
    void FoldLines();
    void Unescape();
    std::uint32_t ReadHex(int digits);

    FormCursor& m_Cursor;
    FormNotes& m_Notes;
    std::string m_Text;    // of pieces
    std::string m_Written; // as the writer would write it
};

} // namespace ovrin_yaml
