#pragma once

#include "Values/YAMLAlloc.h"
#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"

#include <cstddef>
#include <vector>

namespace ovrin_yaml {

/// Which element of one sequence is which element of another: an index map from base to destination.
///
///     base  A B C   destination  C D A     m_Mapping = 2, -1, 0   m_DestinationCount = 3
///
/// A destination index that no entry names is a new element. Two entries may name one index (see
/// FindGenericMapping); of these the later counts.
class YAMLSequenceRemapper {
public:
    std::vector<int> m_Mapping;     ///< one entry per base element: its destination index, or -1
    std::size_t m_DestinationCount; ///< elements of the destination
    /// The map came from matching by key, so that two sides may have added the same element.
    bool m_IsSet;

    YAMLSequenceRemapper(std::size_t baseCount, std::size_t destinationCount, bool isSet)
        : m_Mapping(baseCount, -1), m_DestinationCount(destinationCount), m_IsSet(isSet) {}

    static YAMLSequenceRemapper* MakeIdentity(std::size_t count);

    bool IsIdentity() const;
    /// The destination index of base element `index`; -1 also for an index beyond the map.
    int Target(std::size_t index) const { return index < m_Mapping.size() ? m_Mapping[index] : -1; }

    /// The items at their destination indexes, with null for new elements. Owns nothing.
    /// Throws YAMLError "Cannot change non existing index in YAMLSequence" for a target beyond the
    /// destination.
    NodeList Arrange(const NodeList& items) const;
    /// Brings the elements of `sequence` into their new places and frees those that have none. Its hash and
    /// line become 0.
    void Apply(YAMLSequence& sequence) const;

    void ResetForAlloc() {}
};

} // namespace ovrin_yaml
