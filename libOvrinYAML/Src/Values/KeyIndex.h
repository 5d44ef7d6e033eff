#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace ovrin_yaml {

class YAMLScalar;

/// Where a key stands in an array that is too long to be searched: a hash table from key address to position.
/// Only ever asked for single keys, so that no order can come out of the addresses.
class KeyIndex {
public:
    /// Arrays up to this length are searched in order: at twenty keys that is as fast as any table, and a
    /// table takes more memory than the keys and values.
    static constexpr std::size_t kSearchLimit = 32;

    static constexpr std::uint32_t kMissing = UINT32_MAX;

    /// Makes room for `count` keys in all.
    void Reserve(std::size_t count);
    /// Sets the position of `key`, in place of an earlier one.
    void Set(const YAMLScalar* key, std::uint32_t position);
    /// The position last set for `key`, or kMissing.
    std::uint32_t Find(const YAMLScalar* key) const;
    /// Keys that have a position.
    std::size_t Count() const { return m_Count; }

private:
    struct Slot {
        const YAMLScalar* key = nullptr;
        std::uint32_t position = 0;
    };

    std::size_t PlaceOf(const YAMLScalar* key) const;
    void Rehash(std::size_t capacity);

    std::vector<Slot> m_Slots; // a power of two, at most half full
    std::size_t m_Count = 0;
};

} // namespace ovrin_yaml
