#include "Merge/RecordingConflictResolver.h"

#include "Diff/KeyOrder.h"
#include "Diff/MergeTreeCloneVisitor.h"
#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Merge/DiffMerge.h"
#include "Merge/OperationMerge.h"
#include "Merge/SequenceMerge.h"
#include "Values/YAMLError.h"
#include "Values/YAMLMapping.h"

#include <algorithm>

namespace ovrin_yaml {

bool RecordingConflictResolver::HasPendingConflicts() const {
    return std::any_of(m_Records.begin(), m_Records.end(),
                       [](const Record& record) { return record.resolve == ResolveConflict; });
}

void RecordingConflictResolver::PushRecord(ConflictType type, MergeResolve resolve, const Operation* left,
                                           const Operation* right) {
    m_Records.push_back({m_Path.Keep(), type, resolve, left, right});
}

// One side alone. The default plays no part: a change that nobody conflicts with passes.

const Operation* RecordingConflictResolver::SingleSideResolve(const Operation* operation, ConflictType type) {
    const bool isLeft = IsLeftSide(type);
    const MergeResolve resolve = FindResolve(m_Path.Elements()).value_or(ResolveMerged);
    PushRecord(type, resolve, isLeft ? operation : nullptr, isLeft ? nullptr : operation);
    const bool dropped = resolve == ResolveBase || resolve == ResolveConflict ||
                         (resolve == ResolveLeft && !isLeft) || (resolve == ResolveRight && isLeft);
    return dropped ? nullptr : operation;
}

const Operation* RecordingConflictResolver::OnValueAdded(const AddOperation* operation, ConflictType type) {
    return SingleSideResolve(operation, type);
}

const Operation* RecordingConflictResolver::OnValueChanged(const ChangeOperation* operation,
                                                           ConflictType type) {
    return SingleSideResolve(operation, type);
}

const Operation* RecordingConflictResolver::OnMappingChanged(const ChangeMappingOperation* operation,
                                                             ConflictType type) {
    return SingleSideResolve(operation, type);
}

const Operation* RecordingConflictResolver::OnSequenceChanged(const ChangeSequenceOperation* operation,
                                                              ConflictType type) {
    return SingleSideResolve(operation, type);
}

const Operation* RecordingConflictResolver::OnValueRemoved(const RemoveOperation* operation,
                                                           ConflictType type) {
    const Operation* result = SingleSideResolve(operation, type);
    m_Records.back().left = nullptr;
    m_Records.back().right = nullptr;
    return result;
}

// Both sides.

std::optional<RecordingConflictResolver::Outcome>
RecordingConflictResolver::Decided(MergeResolve found, const Operation* left, const Operation* right) const {
    switch (found) {
    case ResolveLeft:
        return Outcome{left, found};
    case ResolveRight:
        return Outcome{right, found};
    case ResolveMerged:
    case ResolveConflict:
        return std::nullopt;
    default:
        return Outcome{nullptr, found};
    }
}

RecordingConflictResolver::Outcome RecordingConflictResolver::ConflictFallback(const Operation* left,
                                                                               const Operation* right,
                                                                               const Operation* pick) const {
    switch (m_DefaultResolve) {
    case ResolveBlank:
        return {MergeTreeCloneVisitor::CloneBlank(pick), ResolveConflict};
    case ResolveRight:
        return {right, ResolveConflict};
    case ResolveLeft:
        return {left, ResolveConflict};
    default:
        return {nullptr, ResolveConflict};
    }
}

/// Settles a pair by the decision made for it, or else by `settle`, which is told whether an open conflict
/// was asked for and gives the outcome.
template <class Settle>
const Operation* RecordingConflictResolver::ResolvePair(ConflictType type, const Operation* left,
                                                        const Operation* right, const Settle& settle) {
    const MergeResolve found = FindResolve(m_Path.Elements()).value_or(ResolveMerged);
    const std::optional<Outcome> decided = Decided(found, left, right);
    const Outcome outcome = decided ? *decided : settle(found == ResolveConflict);
    PushRecord(type, outcome.resolve, left, right);
    return outcome.operation;
}

const Operation* RecordingConflictResolver::OnSameValueChanged(const ChangeOperation* left,
                                                               const ChangeOperation* right) {
    return ResolvePair(ConflictBothChanges, left, right, [&](bool asConflict) {
        if (!asConflict && left->m_Value->Equals(right->m_Value)) return Outcome{left, ResolveMerged};
        return ConflictFallback(left, right, left);
    });
}

const Operation* RecordingConflictResolver::ResolveRemoveAgainstChange(const RemoveOperation* left,
                                                                       const Operation* right) {
    return ResolvePair(ConflictRemoveAgainstChange, left, right,
                       [&](bool) { return ConflictFallback(left, right, right); });
}

const Operation* RecordingConflictResolver::OnSameValueChanged(const RemoveOperation* left,
                                                               const ChangeOperation* right) {
    return ResolveRemoveAgainstChange(left, right);
}

const Operation* RecordingConflictResolver::OnSameValueChanged(const RemoveOperation* left,
                                                               const ChangeMappingOperation* right) {
    return ResolveRemoveAgainstChange(left, right);
}

const Operation* RecordingConflictResolver::OnSameValueRemoved(const RemoveOperation* left,
                                                               const RemoveOperation* right) {
    const Operation* result = ResolvePair(ConflictBothRemoves, left, right, [&](bool asConflict) {
        return asConflict ? ConflictFallback(left, right, left) : Outcome{left, ResolveMerged};
    });
    m_Records.back().left = nullptr;
    m_Records.back().right = nullptr;
    return result;
}

bool RecordingConflictResolver::MayMergeInside(const Operation* left, const Operation* right) const {
    return left->m_Mergeable && right->m_Mergeable && m_Rules.IsMergeablePath(m_Path.Elements());
}

template <class Change, class MergeInside>
const Operation* RecordingConflictResolver::ResolveContainers(const Change* left, const Change* right,
                                                              const MergeInside& merge) {
    return ResolvePair(ConflictBothChanges, left, right, [&](bool asConflict) {
        if (!asConflict && MayMergeInside(left, right)) return Outcome{merge(), ResolveMerged};
        if (!asConflict && OperationEquals(left, right)) return Outcome{left, ResolveMerged};
        return ConflictFallback(left, right, left);
    });
}

const Operation* RecordingConflictResolver::OnSameMappingChanged(const ChangeMappingOperation* left,
                                                                 const ChangeMappingOperation* right) {
    return ResolveContainers(left, right, [&] { return MergeMappingChanges(left, right, *this); });
}

const Operation* RecordingConflictResolver::OnSameSequenceChanged(const ChangeSequenceOperation* left,
                                                                  const ChangeSequenceOperation* right) {
    return ResolveContainers(left, right, [&] { return MergeSequenceChanges(left, right, *this, true); });
}

const Operation* RecordingConflictResolver::OnSameValueAdded(const AddOperation* left,
                                                             const AddOperation* right) {
    const YAMLNode* leftValue = left->m_Value;
    const YAMLNode* rightValue = right->m_Value;
    const MergeResolve found = FindResolve(m_Path.Elements()).value_or(ResolveMerged);
    if (found == ResolveMerged && MayMergeInside(left, right)) {
        const auto kind = leftValue->GetKind();
        const bool sameKind = kind == rightValue->GetKind();
        // Containers that differ are merged inside, which leaves its own records.
        if (sameKind && kind == YAMLNode::Kind::Mapping &&
            m_DifferenceCheck.Differ(AsMapping(leftValue), AsMapping(rightValue)))
            return MergeAddedMappings(left, right);
        if (sameKind && kind == YAMLNode::Kind::Sequence &&
            m_DifferenceCheck.Differ(AsSequence(leftValue), AsSequence(rightValue)))
            return MergeAddedSequences(left, right);
        const bool equal = sameKind && (kind != YAMLNode::Kind::Scalar || leftValue->Equals(rightValue));
        const Outcome outcome = equal ? Outcome{left, ResolveMerged} : ConflictFallback(left, right, left);
        PushRecord(ConflictBothAdds, outcome.resolve, left, right);
        return outcome.operation;
    }
    return ResolvePair(ConflictBothAdds, left, right, [&](bool asConflict) {
        if (!asConflict && leftValue->Equals(rightValue)) return Outcome{left, ResolveMerged};
        return ConflictFallback(left, right, left);
    });
}

namespace {

/// The value that a merged addition brings, for a tree that takes it as its own. One of a side belongs to the
/// side's tree and is cloned; one that the merge has made itself is used nowhere else, and cloning it at each
/// level of what it holds would be dear.
YAMLNode* TakeValue(const Operation* merged, const Operation* left, const Operation* right) {
    const YAMLNode* value = As<AddOperation>(merged)->m_Value;
    return merged == left || merged == right ? value->Clone() : const_cast<YAMLNode*>(value);
}

} // namespace

const Operation* RecordingConflictResolver::MergeAddedMappings(const AddOperation* left,
                                                               const AddOperation* right) {
    const YAMLMapping nothing;
    const YAMLMapping* leftValue = AsMapping(left->m_Value);
    const YAMLMappingDiff* leftDiff = YAMLMappingDiff::Diff(m_Rules, &nothing, leftValue);
    const YAMLMappingDiff* rightDiff = YAMLMappingDiff::Diff(m_Rules, &nothing, AsMapping(right->m_Value));
    const YAMLMappingDiff* merged = MergeMappingDiffs(leftDiff, rightDiff, *this);
    if (merged->Entries().empty() && m_DefaultResolve == ResolveBase) return nullptr;
    YAMLMapping* value = YAMLAlloc<YAMLMapping>::create(leftValue->m_Flow);
    for (const auto& [key, operation] : merged->Entries())
        value->Insert(key, TakeValue(operation, leftDiff->Find(key), rightDiff->Find(key)));
    ApplyKeyOrder(merged->m_KeyOrder, {}, *value);
    return YAMLAlloc<AddOperation>::create(value, true);
}

const Operation* RecordingConflictResolver::MergeAddedSequences(const AddOperation* left,
                                                                const AddOperation* right) {
    const YAMLSequence nothing;
    const YAMLSequence* leftValue = AsSequence(left->m_Value);
    const YAMLSequenceDiff* leftDiff = YAMLSequenceDiff::Diff(m_Rules, &nothing, leftValue);
    const YAMLSequenceDiff* rightDiff = YAMLSequenceDiff::Diff(m_Rules, &nothing, AsSequence(right->m_Value));
    std::set<int> ignoredDropped;
    const YAMLSequenceDiff* merged = MergeSequenceDiffs(leftDiff, rightDiff, ignoredDropped, *this);
    if (merged->Entries().empty() && m_DefaultResolve == ResolveBase) return nullptr;
    YAMLSequence* value = YAMLAlloc<YAMLSequence>::create(leftValue->m_Flow);
    for (const auto& [index, operation] : merged->Entries())
        value->m_Items.push_back(TakeValue(operation, leftDiff->Find(index), rightDiff->Find(index)));
    return YAMLAlloc<AddOperation>::create(value, true);
}

// What post-processing found.

RecordingConflictResolver::Record* RecordingConflictResolver::FindObjectRecord(const YAMLScalar* fileID) {
    for (; m_IndexedRecords < m_Records.size(); ++m_IndexedRecords) {
        if (const YAMLScalar* id = m_Records[m_IndexedRecords].path.OnlyElement())
            m_ObjectRecords.try_emplace(id, m_IndexedRecords);
    }
    const auto found = m_ObjectRecords.find(fileID);
    return found == m_ObjectRecords.end() ? nullptr : &m_Records[found->second];
}

void RecordingConflictResolver::OnComponentDependencyConflict(const ComponentDependencyConflict& conflict) {
    Record* record =
        FindObjectRecord(conflict.leftComponent ? conflict.leftComponent : conflict.rightComponent);
    if (!record) return;
    record->resolve = ResolveConflict;
    const Operation* removal = YAMLAlloc<RemoveOperation>::create(true);
    if (conflict.conflictType == ConflictRightRemoves) record->right = removal;
    if (conflict.conflictType == ConflictLeftRemoves) record->left = removal;
}

void RecordingConflictResolver::OnTransformCycleDetected(const YAMLScalar* fileID, YAMLMapping& object) {
    const YAMLScalar* classKey = object.HasKey(YAMLScalar::transform)       ? YAMLScalar::transform
                                 : object.HasKey(YAMLScalar::rectTransform) ? YAMLScalar::rectTransform
                                                                            : nullptr;
    if (!classKey) throw new YAMLError("Cycle detected with no Transform or RectTransform");
    const Path path = {fileID, classKey, YAMLScalar::mFather, YAMLScalar::fileID};
    const bool blank = m_DefaultResolve == ResolveBlank;
    const bool breaks = blank || FindResolve(path) == ResolveBreakCycle;
    if (breaks) {
        YAMLMapping* transform = AsMapping(object.Get(classKey));
        YAMLMapping* father = transform ? AsMapping(transform->Get(YAMLScalar::mFather)) : nullptr;
        // A Transform of a prefab instance has its parent stored elsewhere: there is nothing to change here.
        if (father && father->HasKey(YAMLScalar::fileID))
            father->Change(YAMLScalar::fileID, blank ? YAMLScalar::empty : YAMLScalar::zero)->Free();
    }
    m_Records.push_back({WalkedPath(path).Keep(), ConflictTransformCycle,
                         breaks && !blank ? ResolveBreakCycle : ResolveConflict, nullptr, nullptr});
}

} // namespace ovrin_yaml
