#pragma once

#include "Document/YAMLScalar.h"

#include <array>
#include <cstdint>
#include <cstring>
#include <string_view>

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
    static constexpr std::size_t kLongest = 16;

    /// A text of at most kLongest bytes as two words.
    struct Words {
        std::uint64_t low = 0;
        std::uint64_t high = 0;
        std::uint64_t length = 0;
    };

    /// kLongest bytes from the text's start on must be readable.
    static Words Pack(std::string_view text) {
        Words words;
        words.length = text.size();
        std::memcpy(&words.low, text.data(), 8);
        std::memcpy(&words.high, text.data() + 8, 8);
        words.low &= kMasks[text.size()].low;
        words.high &= kMasks[text.size()].high;
        return words;
    }

    struct Entry {
        std::uint64_t low = 0;
        std::uint64_t high = 0;
        YAMLScalar* scalar = nullptr; // null as long as it isn't interned
        std::uint32_t hash = 0;       // of the text
        std::uint16_t length = UINT16_MAX;
        std::uint16_t user = 0; // free for those who put in texts that aren't interned

        bool Holds(const Words& words) const {
            return low == words.low && high == words.high && length == words.length;
        }
    };

    /// Where the text stands, or would stand in place of what is there.
    Entry& At(const Words& words) { return m_Entries[PlaceOf(words)]; }

private:
    static constexpr unsigned kPlaceBits = 11;

    struct Mask {
        std::uint64_t low, high;
    };
    /// The lowest bytes of a pair of words, by their number.
    static constexpr std::array<Mask, kLongest + 1> kMasks = [] {
        const auto lowest = [](std::size_t bytes) {
            return bytes >= 8 ? ~std::uint64_t{0} : (std::uint64_t{1} << 8 * bytes) - 1;
        };
        std::array<Mask, kLongest + 1> masks{};
        for (std::size_t i = 0; i <= kLongest; ++i) masks[i] = {lowest(i), i > 8 ? lowest(i - 8) : 0};
        return masks;
    }();
    static std::size_t PlaceOf(const Words& words) {
        return (words.low ^ words.high * 0x9e3779b97f4a7c15u ^ words.length) * 0xd6e8feb86659fd93u >>
               (64 - kPlaceBits);
    }

    std::array<Entry, std::size_t{1} << kPlaceBits> m_Entries;
};

} // namespace ovrin_yaml
