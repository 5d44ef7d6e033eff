#pragma once

#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"

#include <set>

namespace ovrin_yaml {

class ConflictResolver;

/// Merges the diffs of two sides, key by key. The result holds operations of the inputs, which must outlive
/// it. Nothing but the resolver is changed.
YAMLMappingDiff* MergeMappingDiffs(const YAMLMappingDiff* left, const YAMLMappingDiff* right,
                                   ConflictResolver& resolver);

/// Merges two diffs in one index numbering. Indexes where neither side's operation is taken are added to
/// `droppedIndexes`.
YAMLSequenceDiff* MergeSequenceDiffs(const YAMLSequenceDiff* left, const YAMLSequenceDiff* right,
                                     std::set<int>& droppedIndexes, ConflictResolver& resolver);

} // namespace ovrin_yaml
