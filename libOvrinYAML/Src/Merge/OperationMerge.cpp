#include "Merge/OperationMerge.h"

#include "Diff/YAMLMappingDiff.h"
#include "Merge/DiffMerge.h"
#include "Merge/YAMLConflict.h"

namespace ovrin_yaml {

namespace {

/// A left removal meets a right operation that is no removal.
const Operation* MergeLeftRemoval(const RemoveOperation* left, const Operation* right,
                                  ConflictResolver& resolver) {
    if (const auto* change = As<ChangeOperation>(right)) return resolver.OnSameValueChanged(left, change);
    if (const auto* mapping = As<ChangeMappingOperation>(right))
        return resolver.OnSameValueChanged(left, mapping);
    return resolver.OnValueRemoved(left, ConflictLeftRemoves);
}

/// What is left behind removals, changes and additions: containers that change inside, or nothing.
const Operation* MergeInnerChanges(const Operation* left, const Operation* right,
                                   ConflictResolver& resolver) {
    const auto* leftMapping = As<ChangeMappingOperation>(left);
    const auto* rightMapping = As<ChangeMappingOperation>(right);
    if (leftMapping && rightMapping) return resolver.OnSameMappingChanged(leftMapping, rightMapping);
    if (leftMapping) return resolver.OnMappingChanged(leftMapping, ConflictLeftChanges);
    if (rightMapping) return resolver.OnMappingChanged(rightMapping, ConflictRightChanges);

    const auto* leftSequence = As<ChangeSequenceOperation>(left);
    const auto* rightSequence = As<ChangeSequenceOperation>(right);
    if (leftSequence && rightSequence) return resolver.OnSameSequenceChanged(leftSequence, rightSequence);
    if (leftSequence) return resolver.OnSequenceChanged(leftSequence, ConflictLeftChanges);
    if (rightSequence) return resolver.OnSequenceChanged(rightSequence, ConflictRightChanges);
    return nullptr;
}

} // namespace

/// The order of the tests is the rule. Where the kinds differ, the stronger one goes through as if the other
/// side had done nothing: removal before change before addition before a change inside, and a mapping before
/// a sequence. It isn't even: a right removal beats any left operation, while a left one can meet a conflict.
const Operation* MergeOperations(const Operation* left, const Operation* right, ConflictResolver& resolver) {
    const auto* leftRemove = As<RemoveOperation>(left);
    if (const auto* rightRemove = As<RemoveOperation>(right))
        return leftRemove ? resolver.OnSameValueRemoved(leftRemove, rightRemove)
                          : resolver.OnValueRemoved(rightRemove, ConflictRightRemoves);
    if (leftRemove) return MergeLeftRemoval(leftRemove, right, resolver);

    const auto* leftChange = As<ChangeOperation>(left);
    if (const auto* rightChange = As<ChangeOperation>(right))
        return leftChange ? resolver.OnSameValueChanged(leftChange, rightChange)
                          : resolver.OnValueChanged(rightChange, ConflictRightChanges);
    if (leftChange) return resolver.OnValueChanged(leftChange, ConflictLeftChanges);

    const auto* leftAdd = As<AddOperation>(left);
    if (const auto* rightAdd = As<AddOperation>(right))
        return leftAdd ? resolver.OnSameValueAdded(leftAdd, rightAdd)
                       : resolver.OnValueAdded(rightAdd, ConflictRightAdds);
    if (leftAdd) return resolver.OnValueAdded(leftAdd, ConflictLeftAdds);

    return MergeInnerChanges(left, right, resolver);
}

const ChangeMappingOperation* MergeMappingChanges(const ChangeMappingOperation* left,
                                                  const ChangeMappingOperation* right,
                                                  ConflictResolver& resolver) {
    const YAMLMappingDiff* merged = MergeMappingDiffs(left->m_Diff, right->m_Diff, resolver);
    return YAMLAlloc<ChangeMappingOperation>::create(merged, left->m_Mergeable && right->m_Mergeable);
}

} // namespace ovrin_yaml
