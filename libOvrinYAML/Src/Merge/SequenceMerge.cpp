// The merge of two changes of one sequence.
//
// Each side has numbered the elements in its own way, so that the two diffs can't be merged index by index:
//
//     base A B C     left A x B C     right A B y C
//     left numbering    A=0 x=1 B=2 C=3          right numbering   A=0 B=1 y=2 C=3
//     merged numbering  A=0 x=1 B=2 y=3 C=4      result A x B y C
//
//  1. If only one side moved, added or removed elements, its numbering is the merged one.
//  2. Otherwise: equal changes under the default keys are one; elements that both sides added under one
//     key are settled among themselves, and the right side forgets its own.
//  3. The two numberings are merged: surviving base elements in base order, each side's additions behind the
//     element that they follow, the left ones first.
//  4. Both diffs are brought into the merged numbering and merged index by index.
//  5. Indexes at which nothing was taken leave the numbering again.

#include "Merge/SequenceMerge.h"

#include "Diff/SequenceMatching.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Merge/DiffMerge.h"
#include "Merge/OperationMerge.h"
#include "Merge/RemapperMerge.h"
#include "Merge/YAMLConflict.h"

#include <algorithm>
#include <set>

namespace ovrin_yaml {

namespace {

/// One side's change while it is being merged; either part may be replaced, neither is owned or changed.
struct Side {
    const YAMLSequenceRemapper* remapper;
    const YAMLSequenceDiff* diff;
};

/// Takes destination indexes out of a remapper, as if one after the other from the greatest to the smallest:
/// an entry that names one of them is erased, which moves all later entries one base element forward, and
/// entries above one are lowered. Indexes beyond the destination don't count.
const YAMLSequenceRemapper* ShiftRemapperDown(const YAMLSequenceRemapper* remapper,
                                              const std::set<int>& indexes) {
    const int count = static_cast<int>(remapper->m_DestinationCount);
    const std::vector<int> taken(indexes.begin(), indexes.lower_bound(count));
    YAMLSequenceRemapper* shifted = YAMLAlloc<YAMLSequenceRemapper>::create(
        0, remapper->m_DestinationCount - taken.size(), remapper->m_IsSet);
    shifted->m_Mapping.reserve(remapper->m_Mapping.size());
    for (const int target : remapper->m_Mapping) {
        const auto below = std::lower_bound(taken.begin(), taken.end(), target);
        if (below != taken.end() && *below == target) continue;
        shifted->m_Mapping.push_back(target - static_cast<int>(below - taken.begin()));
    }
    return shifted;
}

/// The additions of one side's diff, as a list of their values.
struct Additions {
    explicit Additions(const YAMLSequenceDiff* diff) {
        for (const auto& entry : diff->Entries()) {
            const auto* add = As<AddOperation>(entry.operation);
            if (!add) continue;
            operations.push_back(add);
            indexes.push_back(entry.index);
            values.m_Items.push_back(const_cast<YAMLNode*>(add->m_Value));
        }
    }

    std::vector<const AddOperation*> operations;
    std::vector<int> indexes; // in the numbering of the side
    YAMLSequence values;      // only looked at; the nodes belong to the operations' trees
};

/// Settles the elements that both sides added under one key, so that the merged list holds each once.
void MergeCommonAdditions(Side& left, Side& right, const std::vector<Path>& keyPaths,
                          ConflictResolver& resolver) {
    const Additions leftAdded(left.diff), rightAdded(right.diff);
    YAMLSequenceRemapper* matches = FindIdMapping(keyPaths, &leftAdded.values, &rightAdded.values);
    std::set<int> matchedRight;
    YAMLSequenceDiff* settled = nullptr;
    for (std::size_t i = 0; i < matches->m_Mapping.size(); ++i) {
        const int j = matches->m_Mapping[i];
        if (j == -1) continue;
        if (!settled) settled = YAMLAlloc<YAMLSequenceDiff>::create(*left.diff);
        resolver.PushPath(IndexScalar(leftAdded.indexes[i]));
        const Operation* result =
            MergeOperations(leftAdded.operations[i], rightAdded.operations[j], resolver);
        resolver.PopPath();
        settled->Replace(leftAdded.indexes[i], result);
        matchedRight.insert(rightAdded.indexes[j]);
    }
    YAMLAlloc<YAMLSequenceRemapper>::free(matches);
    if (!settled) return;
    left.diff = settled;
    YAMLSequenceDiff* rest = YAMLAlloc<YAMLSequenceDiff>::create(*right.diff);
    rest->RemoveAndShiftMany(matchedRight);
    right.diff = rest;
    right.remapper = ShiftRemapperDown(right.remapper, matchedRight);
}

/// Brings both sides into one numbering, where both have one of their own; the result leads to it from the
/// base.
const YAMLSequenceRemapper* MergeNumberings(Side& left, Side& right, bool removeUnmatched) {
    const MergedRemappers numberings = MergeRemappers(left.remapper, right.remapper, removeUnmatched);
    left.diff = left.diff->Remap(numberings.leftToMerged);
    right.diff = right.diff->Remap(numberings.rightToMerged);
    YAMLAlloc<YAMLSequenceRemapper>::free(numberings.leftToMerged);
    YAMLAlloc<YAMLSequenceRemapper>::free(numberings.rightToMerged);
    return numberings.merged;
}

/// The numbering of the one side that has one becomes the other side's. A change of an element that was
/// removed is dropped here, without a question: a removal beats a change in a list.
const YAMLSequenceRemapper* TakeOnlyNumbering(Side& left, Side& right) {
    if (left.remapper && !left.remapper->m_Mapping.empty()) right.diff = right.diff->Remap(left.remapper);
    if (right.remapper && !right.remapper->m_Mapping.empty()) left.diff = left.diff->Remap(right.remapper);
    return left.remapper ? left.remapper : right.remapper;
}

} // namespace

const ChangeSequenceOperation* MergeSequenceChanges(const ChangeSequenceOperation* left,
                                                    const ChangeSequenceOperation* right,
                                                    ConflictResolver& resolver, bool removeUnmatched) {
    Side leftSide{left->m_Remapper, left->m_Diff}, rightSide{right->m_Remapper, right->m_Diff};
    const YAMLSequenceRemapper* baseMap = nullptr;
    if (leftSide.remapper && rightSide.remapper) {
        const ListRule& rule = resolver.m_Rules.SelectKeyPaths(resolver.m_Path.Elements());
        if (!left->m_Diff->Entries().empty() && !right->m_Diff->Entries().empty() && rule.isDefault &&
            resolver.m_Comparison.AreEqual(left, right))
            return left;
        if (leftSide.remapper->m_IsSet) MergeCommonAdditions(leftSide, rightSide, rule.keys, resolver);
        baseMap = MergeNumberings(leftSide, rightSide, removeUnmatched);
    } else {
        baseMap = TakeOnlyNumbering(leftSide, rightSide);
    }
    std::set<int> droppedIndexes;
    const YAMLSequenceDiff* merged =
        MergeSequenceDiffs(leftSide.diff, rightSide.diff, droppedIndexes, resolver);
    if (baseMap && baseMap->m_Mapping.empty()) baseMap = nullptr;
    // The indexes of the merged diff are not shifted along, and an element of the base that is dropped takes
    // its entry in the numbering with it: a list conflict that keeps the base can cost a later element its
    // place.
    if (baseMap && !droppedIndexes.empty()) baseMap = ShiftRemapperDown(baseMap, droppedIndexes);
    return YAMLAlloc<ChangeSequenceOperation>::create(merged, baseMap,
                                                      left->m_Mergeable && right->m_Mergeable);
}

} // namespace ovrin_yaml
