#pragma once

#include "Reading/Fast/BatchedBuilder.h"
#include "Reading/Fast/FormCursor.h"
#include "Reading/Fast/FormNotes.h"
#include "Reading/Fast/KnownKeys.h"
#include "Reading/Fast/QuotedText.h"

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace ovrin_yaml {

/// A document under way: where it is read, what was noted of its form, and the tree that grows. The grammars
/// of block and flow style work on it together.
struct FormReading {
    FormCursor cursor;
    FormNotes notes;
    QuotedText quoted{cursor, notes};
    BatchedBuilder builder; ///< keeps the texts that wait for their scalars from one document to the next
    KnownKeys keys;         ///< of all documents so far
    int depth = 0;          ///< open collections

    /// The parser looks for the colon behind a key within 1024 characters.
    static constexpr std::ptrdiff_t kLongestKey = 1000;

    void Begin(std::string_view text, std::uint32_t firstLine);

    /// Adds the plain key from here to `end`, which wasn't guessed. It can be guessed from now on if it is
    /// the same in any place, whatever stands around it: plain in both styles, without blanks, and what the
    /// writer writes for it. Ends behind the colon.
    KnownKey& AddKey(const char* end, const KnownKey& parent, KeyGuess& guess);
    /// Adds the quoted value that begins here. Ends behind it.
    void AddQuoted(bool inFlow);
    /// As BatchedBuilder::CloseMapping. A mapping that repeats a key is left to the library's path.
    void CloseMapping(std::size_t mark, bool flow, std::uint32_t line, std::size_t unhashed = 0) {
        if (!builder.CloseMapping(mark, flow, line, unhashed)) throw NotSure();
    }
};

/// Counts a collection that is open. Deep nesting is left to the library, which has the limit; its own is a
/// little more.
class Nesting {
public:
    explicit Nesting(FormReading& form) : m_Form(form) {
        if (++m_Form.depth > kSafeDepth) throw NotSure();
    }
    ~Nesting() { --m_Form.depth; }
    Nesting(const Nesting&) = delete;
    Nesting& operator=(const Nesting&) = delete;

private:
    static constexpr int kSafeDepth = 990;

    FormReading& m_Form;
};

} // namespace ovrin_yaml
