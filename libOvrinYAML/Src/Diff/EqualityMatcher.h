#pragma once

#include "Values/YAMLSequence.h"

#include <cstddef>
#include <cstdint>
#include <unordered_map>
#include <vector>

namespace ovrin_yaml {

/// Hands out the elements of a stretch of a list, each once, to those who ask for the first equal one.
///
/// The result is that of a search from the low end past the elements that were taken; what differs is the
/// cost. A scalar equals none but itself, and equal containers have equal hashes, with two exceptions that
/// are kept apart:
///
///     bucket of each scalar   positions, ascending: [5, 9, 11]; taken ones leave at the front
///     bucket of each hash     the same, of scalars too, which a container of their hash equals
///     odd positions           mappings with repeated keys and unhashed containers that aren't empty:
///                             an element of another hash may equal them
///
/// An element that is odd itself is compared with the whole stretch.
class EqualityMatcher {
public:
    /// The stretch from `begin` up to `end` (not included) of `items`, which must outlive the matcher.
    EqualityMatcher(const NodeList& items, std::size_t begin, std::size_t end);

    /// Takes the first free position whose item equals `element`; -1 if there is none.
    int TakeFirstEqual(const YAMLNode* element);

private:
    struct Bucket {
        std::vector<std::uint32_t> positions;
        std::size_t firstFree = 0;
    };

    template <class Buckets, class KeyOf> void FillOnce(Buckets& buckets, const KeyOf& keyOf) const;
    template <class Buckets, class Key>
    std::size_t FirstIn(Buckets& buckets, const Key& key, const YAMLNode* element) const;
    std::size_t FirstAmong(const std::vector<std::uint32_t>& positions, const YAMLNode* element) const;
    bool IsFreeAndEqual(std::size_t position, const YAMLNode* element) const;

    const NodeList& m_Items;
    const std::size_t m_Begin;
    std::vector<bool> m_Taken; // by position less m_Begin
    // Each is filled when it is needed first: most lists have elements of one kind.
    std::unordered_map<const YAMLNode*, Bucket> m_ScalarBuckets;
    std::unordered_map<std::uint32_t, Bucket> m_HashBuckets;
    std::vector<std::uint32_t> m_All;
    std::vector<std::uint32_t> m_Odd;
};

} // namespace ovrin_yaml
