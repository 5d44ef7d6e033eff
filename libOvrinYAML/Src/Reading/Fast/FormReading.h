#pragma once

#include "Reading/Fast/FormCursor.h"
#include "Reading/Fast/FormNotes.h"
#include "Reading/Fast/KnownKeys.h"
#include "Reading/Fast/QuotedText.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace ovrin_yaml {

static_assert(kLongestSimpleKey <= KnownKey::kLongest, "what the writer writes can be guessed");

/// A document under way: where it is read, what was noted of its form, and what becomes of it. The grammars
/// of block and flow style work on it together. `Builder` is handed the parts of the document from the inside
/// out, as BatchedBuilder is, which makes trees of them; another one may take less of it.
template <class Builder> struct FormReading {
    FormCursor cursor;
    FormNotes notes;
    QuotedText quoted{cursor, notes};
    Builder builder; ///< keeps the texts that wait for their scalars from one document to the next
    KnownKeys keys;  ///< of all documents so far
    int depth = 0;   ///< open collections

    /// The parser looks for the colon behind a key within 1024 characters.
    static constexpr std::ptrdiff_t kLongestKey = 1000;

    void Begin(std::string_view text, std::uint32_t firstLine);

    /// Adds the plain key from here to `end`, which wasn't guessed. It can be guessed from now on if it is
    /// the same in any place, whatever stands around it: plain in both styles, without blanks, and what the
    /// writer writes for it. Ends behind the colon.
    KnownKey& AddKey(const char* end, const KnownKey& parent, KeyGuess& guess);
    /// Adds the quoted value that begins here. Ends behind it.
    void AddQuoted(QuotedPlace place);
    /// As the builder's function. A mapping that the builder refuses is left to the library's path.
    void CloseMapping(std::size_t mark, bool flow, std::uint32_t line, std::size_t unhashed = 0) {
        if (!builder.CloseMapping(mark, flow, line, unhashed)) throw NotSure();
    }
};

template <class Builder> void FormReading<Builder>::Begin(std::string_view text, std::uint32_t firstLine) {
    cursor.Begin(text, firstLine);
    notes.Begin();
    depth = 0;
}

template <class Builder>
KnownKey& FormReading<Builder>::AddKey(const char* end, const KnownKey& parent, KeyGuess& guess) {
    const std::string_view text(cursor.Position(), end);
    YAMLScalar* scalar = builder.Intern(text);
    builder.AddScalar(scalar);
    cursor.MoveTo(end + 1);
    const bool isWritten = notes.NoteKey(text);
    const bool isSame = IsPlainStart(text[0]) && std::all_of(text.begin(), text.end(), IsPlainInFlow);
    return isWritten && isSame ? keys.Learn(parent, scalar, guess) : keys.Unknown();
}

template <class Builder> void FormReading<Builder>::AddQuoted(QuotedPlace place) {
    const std::string_view text = quoted.Read(place);
    if (quoted.Holds(text))
        builder.AddPassingText(text);
    else
        builder.AddText(text);
}

/// Counts a collection that is open. Deep nesting is left to the library, which has the limit; its own is a
/// little more.
class Nesting {
public:
    explicit Nesting(int& depth) : m_Depth(depth) {
        if (++m_Depth > kSafeDepth) throw NotSure();
    }
    ~Nesting() { --m_Depth; }
    Nesting(const Nesting&) = delete;
    Nesting& operator=(const Nesting&) = delete;

private:
    static constexpr int kSafeDepth = 990;

    int& m_Depth;
};

} // namespace ovrin_yaml
