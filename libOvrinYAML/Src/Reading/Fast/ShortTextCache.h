#pragma once

#include "Values/ShortText.h"
#include "Values/YAMLScalar.h"

#include <array>
#include <cstdint>

namespace ovrin_yaml {

/// Remembers scalars of short texts that were met lately: the keys and the small numbers of a scene come
/// again and again.
///
///     "m_Father"  ->  8 bytes | 0 | length 8  ->  place  ->  the same words there?  the scalar
///
/// A look-up is a multiplication and a comparison of words, with no hash over the text. Of two texts with one
/// place the later one stays. Belongs to one thread.
class ShortTextCache {
public:
    struct Entry {
        std::uint64_t low = 0;
        std::uint64_t high = 0;
        YAMLScalar* scalar = nullptr; // null as long as it isn't interned
        std::uint32_t hash = 0;       // of the text
        std::uint16_t length = UINT16_MAX;
        std::uint16_t user = 0; // free for those who put in texts that aren't interned

        bool Holds(const ShortText& text) const {
            return low == text.low && high == text.high && length == text.length;
        }
    };

    /// Where the text stands, or would stand in place of what is there.
    Entry& At(const ShortText& text) { return m_Entries[PlaceOf(text)]; }

private:
    static constexpr unsigned kPlaceBits = 11;

    static std::size_t PlaceOf(const ShortText& text) {
        return (text.low ^ text.high * 0x9e3779b97f4a7c15u ^ text.length) * 0xd6e8feb86659fd93u >>
               (64 - kPlaceBits);
    }

    std::array<Entry, std::size_t{1} << kPlaceBits> m_Entries;
};

} // namespace ovrin_yaml
