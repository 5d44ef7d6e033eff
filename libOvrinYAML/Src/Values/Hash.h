#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace ovrin_yaml {

/// MurmurHash3 by Austin Appleby, 32-bit x86 form, over the bytes of `text` (public domain, smhasher).
std::uint32_t MurmurHash3(std::string_view text, std::uint32_t seed);

/// The same for a text of at most 16 bytes that stands in two words, the first byte lowest, with zeros behind
/// it.
std::uint32_t MurmurHash3(std::uint64_t low, std::uint64_t high, std::size_t length, std::uint32_t seed);

/// Folds one value into a running container hash. Order counts.
inline std::uint32_t CombineHash(std::uint32_t seed, std::uint32_t value) {
    return seed ^ (value + 0x9e3779b9u + (seed << 6) + (seed >> 2));
}

/// The hash of a mapping so far, with the pair at zero-based position `index` folded in.
inline std::uint32_t FoldPair(std::uint32_t seed, std::uint32_t key, std::uint32_t value,
                              std::uint32_t index) {
    return CombineHash(CombineHash(CombineHash(seed, key), value), index);
}

/// The hash of a sequence so far, with the item at zero-based position `index` folded in.
inline std::uint32_t FoldItem(std::uint32_t seed, std::uint32_t item, std::uint32_t index) {
    return CombineHash(CombineHash(seed, item), index);
}

} // namespace ovrin_yaml
