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

#include "Diff/YAMLSequenceDiff.h"
#include "Merge/CommonAdditions.h"
#include "Merge/DiffMerge.h"
#include "Merge/OperationMerge.h"
#include "Merge/RemapperMerge.h"
#include "Merge/YAMLConflict.h"

#include <set>

namespace ovrin_yaml {

namespace {

/// One side's change while it is being merged; either part may be replaced, neither is owned or changed.
struct Side {
    const YAMLSequenceRemapper* remapper;
    const YAMLSequenceDiff* diff;
};

/// Settles the elements that both sides added under one key, so that the merged list holds each once.
void MergeCommonAdditions(Side& left, Side& right, const std::vector<Path>& keyPaths,
                          ConflictResolver& resolver) {
    std::set<int> matchedRight;
    YAMLSequenceDiff* settled = nullptr;
    for (const CommonAddition& common : FindCommonAdditions(*left.diff, *right.diff, keyPaths)) {
        if (!settled) settled = YAMLAlloc<YAMLSequenceDiff>::create(*left.diff);
        resolver.PushPath(IndexScalar(common.leftIndex));
        const Operation* result = MergeOperations(common.left, common.right, resolver);
        resolver.PopPath();
        settled->Replace(common.leftIndex, result);
        matchedRight.insert(common.rightIndex);
    }
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
