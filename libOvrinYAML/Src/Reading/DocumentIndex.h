#pragma once

#include "Values/SeededHash.h"

#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

namespace ovrin_yaml {

/// File id to document of a file: a hash table with open addressing that holds numbers of documents alone, so
/// that a hundred thousand ids cost no allocations. The hash is one that nobody can foretell.
///
///     slots   [ . | hash of "12", 0 | . | hash of "7", 2 | hash of "93", 1 | . ]
class DocumentIndex {
public:
    static constexpr std::size_t kMissing = SIZE_MAX;

    bool IsEmpty() const { return m_Slots.empty(); }
    /// Indexes `count` documents; idOf(i) is the id of the i-th. The first of an id counts. What comes behind
    /// some 2^32 of them is not found.
    template <class IDOf> void Build(std::size_t count, const IDOf& idOf);
    /// The document of an id, or kMissing.
    template <class IDOf> std::size_t Find(std::string_view id, const IDOf& idOf) const {
        const std::size_t hash = m_Hash(id);
        const Slot& slot = m_Slots[PlaceOf(hash, [&](std::size_t i) { return idOf(i) == id; })];
        return slot.number ? slot.number - 1 : kMissing;
    }

private:
    struct Slot {
        std::uint32_t hash = 0;   // its upper half
        std::uint32_t number = 0; // of the document, from 1 on; 0: empty
    };

    static std::uint32_t UpperHalf(std::size_t hash) { return static_cast<std::uint32_t>(hash >> 32); }
    /// Where the id of this hash stands, of which isMeant tells, or would stand.
    template <class IsMeant> std::size_t PlaceOf(std::size_t hash, const IsMeant& isMeant) const;

    SeededHash m_Hash;
    std::vector<Slot> m_Slots; // a power of two, at most half full
};

template <class IDOf> void DocumentIndex::Build(std::size_t count, const IDOf& idOf) {
    count = std::min<std::size_t>(count, UINT32_MAX);
    m_Slots.resize(std::bit_ceil(2 * count + 1));
    for (std::size_t i = 0; i < count; ++i) {
        const std::string_view id = idOf(i);
        const std::size_t hash = m_Hash(id);
        Slot& slot = m_Slots[PlaceOf(hash, [&](std::size_t other) { return idOf(other) == id; })];
        if (!slot.number) slot = {UpperHalf(hash), static_cast<std::uint32_t>(i + 1)};
    }
}

template <class IsMeant> std::size_t DocumentIndex::PlaceOf(std::size_t hash, const IsMeant& isMeant) const {
    const std::size_t mask = m_Slots.size() - 1;
    for (std::size_t place = hash & mask;; place = (place + 1) & mask) {
        const Slot& slot = m_Slots[place];
        if (!slot.number || (slot.hash == UpperHalf(hash) && isMeant(slot.number - 1))) return place;
    }
}

} // namespace ovrin_yaml
