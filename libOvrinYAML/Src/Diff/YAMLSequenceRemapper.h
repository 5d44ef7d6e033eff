#pragma once

#include "Values/YAMLAlloc.h"
#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"

#include <cstddef>
#include <string>
#include <utility>
#include <vector>

namespace ovrin_yaml {

struct DiffContext;

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

    /// The map that brings `base` into the order of `dest`, by key where every element of both has a key of
    /// its own, by equality otherwise; null if every element stays where it is. The path chooses the rule.
    static YAMLSequenceRemapper* FindMapping(const DiffContext& context, const YAMLSequence* base,
                                             const YAMLSequence* dest);
    /// The same for two lists of texts that stand in each of them once, as the keys of mappings do.
    static YAMLSequenceRemapper* FindKeyListMapping(const YAMLSequence* base, const YAMLSequence* dest);
    /// The same by equality: a common prefix and suffix, which may overlap, and between them each base
    /// element with the first equal destination element that is still free.
    static YAMLSequenceRemapper* FindGenericMapping(const YAMLSequence* base, const YAMLSequence* dest);
    /// Lenient matching by key, from indexes of `first` to indexes of `second`. An element without a key
    /// stays unmatched and of a repeated key in `second` the last one counts. Never null.
    static YAMLSequenceRemapper* FindIdMapping(const std::vector<Path>& keyPaths, const YAMLSequence* first,
                                               const YAMLSequence* second);
    /// The texts joined by ":".
    static std::string CollapseKeyElementValues(const std::vector<const YAMLScalar*>& values);

    /// Merges the maps of two sides over one base; see SequenceMerge.cpp. All three results are new. Takes
    /// any map: a target beyond its destination counts as none, base elements beyond the left map don't
    /// count, and those beyond the right one have no place there.
    static YAMLSequenceRemapper* Merge(const YAMLSequenceRemapper* left, const YAMLSequenceRemapper* right,
                                       YAMLSequenceRemapper*& leftToMerged,
                                       YAMLSequenceRemapper*& rightToMerged, bool removeUnmatched);

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
