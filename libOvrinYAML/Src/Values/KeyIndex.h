#pragma once

#include "Values/Arena.h"

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
    /// Sets the position of `key` unless it has one. Returns whether it had none.
    bool Insert(const YAMLScalar* key, std::uint32_t position);
    /// The position last set for `key`, or kMissing.
    std::uint32_t Find(const YAMLScalar* key) const;
    /// Starts to load where `key` would be found first.
    void Prefetch(const YAMLScalar* key) const {
        if (!m_Slots.empty()) __builtin_prefetch(&m_Slots[FirstPlaceOf(key) & (m_Slots.size() - 1)]);
    }
    /// Keys that have a position.
    std::size_t Count() const { return m_Count; }

private:
    struct Slot {
        const YAMLScalar* key = nullptr;
        std::uint32_t position = 0;
    };

    /// Addresses are multiples of eight and close to each other: this spreads them (Fibonacci hashing).
    static std::size_t FirstPlaceOf(const YAMLScalar* key) {
        return (reinterpret_cast<std::uintptr_t>(key) >> 3) * 0x9e3779b97f4a7c15u >> 20;
    }
    std::size_t PlaceOf(const YAMLScalar* key) const;
    /// The slot of `key`, which is empty if the key has no position.
    Slot& NeedSlot(const YAMLScalar* key);
    void Rehash(std::size_t capacity);

    using SlotVector = std::vector<Slot, HugePageAllocator<Slot>>;

    SlotVector m_Slots; // a power of two, at most half full
    std::size_t m_Count = 0;
};

} // namespace ovrin_yaml
