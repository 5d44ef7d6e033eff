#pragma once

#include "Diff/MergeRules.h"
#include "Diff/Operation.h"
#include "Diff/OperationComparison.h"
#include "Merge/ConflictType.h"
#include "Merge/MergeResolve.h"
#include "Merge/PropertyPath.h"
#include "Values/YAMLScalar.h"

#include <unordered_set>
#include <vector>

namespace ovrin_yaml {

/// A removal that broke what a component needs. The component's file id stands on the side that still has it.
struct ComponentDependencyConflict {
    const YAMLScalar* leftComponent;  // or YAMLScalar::null
    const YAMLScalar* rightComponent; // or YAMLScalar::null
    ConflictType conflictType;        // ConflictLeftRemoves or ConflictRightRemoves
};

/// Decides every key or index that at least one side changed. The merge of two diffs calls one operation of
/// the resolver for each; what the call returns enters the merged diff, and null keeps the base value.
///
/// A resolver serves one merge on one thread. `left` and `right` are the sides' operations for one key.
class ConflictResolver {
public:
    /// The rules that the sides' diffs were made by. They must outlive the resolver and stay as they are.
    const MergeRules& m_Rules;
    /// The path of the property being merged: the object's file id, then mapping keys and, for elements of
    /// sequences, the merged index (for elements added on both sides of a list with keys, the left index).
    /// The key list of any mapping has the path "_". The merge of key lists replaces the path as a whole.
    WalkedPath m_Path;
    /// Compares the sides' changes of lists.
    OperationComparison m_Comparison;

    virtual const Operation* OnValueAdded(const AddOperation* operation, ConflictType) { return operation; }
    virtual const Operation* OnValueChanged(const ChangeOperation* operation, ConflictType) {
        return operation;
    }
    virtual const Operation* OnValueRemoved(const RemoveOperation* operation, ConflictType) {
        return operation;
    }
    virtual const Operation* OnMappingChanged(const ChangeMappingOperation* operation, ConflictType) {
        return operation;
    }
    virtual const Operation* OnSequenceChanged(const ChangeSequenceOperation* operation, ConflictType) {
        return operation;
    }
    /// `object` is the mapping of the Transform that is its own ancestor; it may be changed.
    virtual void OnTransformCycleDetected(const YAMLScalar* /*fileID*/, YAMLMapping& /*object*/) {}

    virtual const Operation* OnSameValueAdded(const AddOperation* left, const AddOperation* right) = 0;
    virtual const Operation* OnSameValueChanged(const ChangeOperation* left,
                                                const ChangeOperation* right) = 0;
    virtual const Operation* OnSameValueChanged(const RemoveOperation* left,
                                                const ChangeOperation* right) = 0;
    virtual const Operation* OnSameValueChanged(const RemoveOperation* left,
                                                const ChangeMappingOperation* right) = 0;
    virtual const Operation* OnSameValueRemoved(const RemoveOperation* left, const RemoveOperation*) {
        return left;
    }
    virtual const Operation* OnSameMappingChanged(const ChangeMappingOperation* left,
                                                  const ChangeMappingOperation* right) = 0;
    virtual const Operation* OnSameSequenceChanged(const ChangeSequenceOperation* left,
                                                   const ChangeSequenceOperation* right) = 0;
    virtual void OnComponentDependencyConflict(const ComponentDependencyConflict& conflict) = 0;

    /// Steps down to `key`. A visit of m_Father directly below a Transform or RectTransform notes the object
    /// as one whose parent may have changed, whatever the outcome at that key.
    void PushPath(const YAMLScalar* key);
    /// Throws YAMLError "Tried to pop on empty ConflictResolver path".
    void PopPath();

    /// Root keys of the objects noted by PushPath, each once, in the order of the first visits.
    const std::vector<const YAMLScalar*>& ChangedTransforms() const { return m_ChangedTransforms; }

protected:
    explicit ConflictResolver(const MergeRules& rules) : m_Rules(rules) {}
    ~ConflictResolver() = default;

private:
    std::vector<const YAMLScalar*> m_ChangedTransforms;
    std::unordered_set<const YAMLScalar*> m_IsChangedTransform;
};

/// Takes one side wherever both touched a key, without a look at the values; only mappings are merged inside.
class SidePickingConflictResolver final : public ConflictResolver {
public:
    /// Throws YAMLError unless `side` is ResolveLeft or ResolveRight.
    SidePickingConflictResolver(const MergeRules& rules, MergeResolve side);

    const Operation* OnSameValueAdded(const AddOperation* left, const AddOperation* right) override;
    const Operation* OnSameValueChanged(const ChangeOperation* left, const ChangeOperation* right) override;
    const Operation* OnSameValueChanged(const RemoveOperation* left, const ChangeOperation* right) override;
    const Operation* OnSameValueChanged(const RemoveOperation* left,
                                        const ChangeMappingOperation* right) override;
    const Operation* OnSameMappingChanged(const ChangeMappingOperation* left,
                                          const ChangeMappingOperation* right) override;
    const Operation* OnSameSequenceChanged(const ChangeSequenceOperation* left,
                                           const ChangeSequenceOperation* right) override;
    [[noreturn]] void OnComponentDependencyConflict(const ComponentDependencyConflict& conflict) override;

private:
    const Operation* Pick(const Operation* left, const Operation* right) const;

    const MergeResolve m_Side;
};

/// Takes it for a defect when both sides touched a key, but for a removal on both: throws YAMLError.
class ExceptionConflictResolver final : public ConflictResolver {
public:
    explicit ExceptionConflictResolver(const MergeRules& rules) : ConflictResolver(rules) {}

    [[noreturn]] const Operation* OnSameValueAdded(const AddOperation* left,
                                                   const AddOperation* right) override;
    [[noreturn]] const Operation* OnSameValueChanged(const ChangeOperation* left,
                                                     const ChangeOperation* right) override;
    [[noreturn]] const Operation* OnSameValueChanged(const RemoveOperation* left,
                                                     const ChangeOperation* right) override;
    [[noreturn]] const Operation* OnSameValueChanged(const RemoveOperation* left,
                                                     const ChangeMappingOperation* right) override;
    [[noreturn]] const Operation* OnSameMappingChanged(const ChangeMappingOperation* left,
                                                       const ChangeMappingOperation* right) override;
    [[noreturn]] const Operation* OnSameSequenceChanged(const ChangeSequenceOperation* left,
                                                        const ChangeSequenceOperation* right) override;
    [[noreturn]] void OnComponentDependencyConflict(const ComponentDependencyConflict& conflict) override;
};

} // namespace ovrin_yaml
