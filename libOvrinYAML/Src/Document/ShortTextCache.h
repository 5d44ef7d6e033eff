#pragma once

#include <array>
#include <cstdint>
#include <cstring>
#include <string_view>

namespace ovrin_yaml {

class YAMLScalar;

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
        std::uint32_t length = 0;

        bool operator==(const Words&) const = default;
    };

    /// `readable` is the number of bytes from the text's start on that may be read.
    static Words Pack(std::string_view text, std::size_t readable) {
        Words words;
        words.length = static_cast<std::uint32_t>(text.size());
        if (readable < kLongest) {
            char copy[kLongest] = {};
            std::memcpy(copy, text.data(), text.size());
            std::memcpy(&words.low, copy, 8);
            std::memcpy(&words.high, copy + 8, 8);
            return words;
        }
        std::memcpy(&words.low, text.data(), 8);
        std::memcpy(&words.high, text.data() + 8, 8);
        words.low &= Mask(text.size());
        words.high &= text.size() > 8 ? Mask(text.size() - 8) : 0;
        return words;
    }

    /// The scalar, or null if it isn't remembered.
    YAMLScalar* Find(const Words& words) const {
        const Entry& entry = m_Entries[PlaceOf(words)];
        return entry.words == words ? entry.scalar : nullptr;
    }
    void Remember(const Words& words, YAMLScalar* scalar) { m_Entries[PlaceOf(words)] = {words, scalar}; }

private:
    struct Entry {
        Words words;
        YAMLScalar* scalar = nullptr;
    };
    static constexpr unsigned kPlaceBits = 11;

    /// The lowest `bytes` bytes, of which there are eight at the most.
    static std::uint64_t Mask(std::size_t bytes) {
        return bytes >= 8 ? ~std::uint64_t{0} : (std::uint64_t{1} << 8 * bytes) - 1;
    }
    static std::size_t PlaceOf(const Words& words) {
        return (words.low ^ words.high * 0x9e3779b97f4a7c15u ^ words.length) * 0xd6e8feb86659fd93u >>
               (64 - kPlaceBits);
    }

    std::array<Entry, std::size_t{1} << kPlaceBits> m_Entries;
};

} // namespace ovrin_yaml
