#pragma once

#include "Diff/YAMLSequenceRemapper.h"

#include <set>

namespace ovrin_yaml {

/// The numberings of two sides brought into one; all three maps are new.
///
///     left A x B C   right A B y C     merged A x B y C
///     merged 0 2 4   leftToMerged 0 1 2 4   rightToMerged 0 2 3 4
struct MergedRemappers {
    YAMLSequenceRemapper* merged; // from the base
    YAMLSequenceRemapper* leftToMerged;
    YAMLSequenceRemapper* rightToMerged;
};

/// Merges the maps of two sides over one base: surviving base elements in base order, each side's additions
/// behind the element that they follow, the left ones first. With `removeUnmatched` an element survives that
/// both sides have, without it one that either has.
///
/// Takes any map: a target beyond its destination counts as none, base elements beyond the left map don't
/// count, and those beyond the right one have no place there.
MergedRemappers MergeRemappers(const YAMLSequenceRemapper* left, const YAMLSequenceRemapper* right,
                               bool removeUnmatched);

/// Takes destination indexes out of a remapper, as if one after the other from the greatest to the smallest:
/// an entry that names one of them is erased, which moves all later entries one base element forward, and
/// entries above one are lowered. Indexes beyond the destination don't count.
const YAMLSequenceRemapper* ShiftRemapperDown(const YAMLSequenceRemapper* remapper,
                                              const std::set<int>& indexes);

} // namespace ovrin_yaml
