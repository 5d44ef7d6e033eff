#pragma once

#include "Diff/DifferenceCheck.h"
#include "Merge/ResolveTable.h"
#include "Merge/YAMLConflict.h"
#include "Values/Arena.h"

#include <optional>
#include <span>
#include <unordered_map>
#include <vector>

namespace ovrin_yaml {

/// The resolver of every real merge. It settles each pair of operations as far as it can, merges further down
/// where the rules allow, and writes a record of every decision. A conflict doesn't stop the merge: the value
/// goes by the default, and the conflict stays pending in its record, whatever the default is.
class RecordingConflictResolver final : public ConflictResolver {
public:
    struct Record {
        KeptPath path;
        ConflictType type;
        /// How it was settled; ResolveConflict marks a pending conflict.
        MergeResolve resolve;
        /// The sides' operations, or null; removals carry none unless a dependency made them a conflict.
        const Operation* left;
        const Operation* right;
    };
    using RecordResolve = ovrin_yaml::RecordResolve;

    RecordingConflictResolver(const MergeRules& rules, MergeResolve defaultResolve)
        : ConflictResolver(rules), m_DifferenceCheck(rules), m_DefaultResolve(defaultResolve) {}

    /// The decisions to go by, in place of earlier ones. Of several that match a path the first counts.
    void SetResolveMethodForPaths(const std::vector<RecordResolve>& resolves) { m_Resolves.Set(resolves); }
    const std::vector<RecordResolve>& Resolves() const { return m_Resolves.All(); }
    /// In the order of the decisions; that of a merged container stands behind those of what it holds.
    std::span<const Record> Records() const { return m_Records; }
    bool HasPendingConflicts() const;

    const Operation* OnValueAdded(const AddOperation* operation, ConflictType type) override;
    const Operation* OnValueChanged(const ChangeOperation* operation, ConflictType type) override;
    const Operation* OnValueRemoved(const RemoveOperation* operation, ConflictType type) override;
    const Operation* OnMappingChanged(const ChangeMappingOperation* operation, ConflictType type) override;
    const Operation* OnSequenceChanged(const ChangeSequenceOperation* operation, ConflictType type) override;
    /// Breaks the cycle at the object, a Transform, where that was decided or blanks are wanted, and records
    /// it. Throws a pointer to a YAMLError if the object is no Transform.
    void OnTransformCycleDetected(const YAMLScalar* fileID, YAMLMapping& object) override;
    const Operation* OnSameValueAdded(const AddOperation* left, const AddOperation* right) override;
    const Operation* OnSameValueChanged(const ChangeOperation* left, const ChangeOperation* right) override;
    const Operation* OnSameValueChanged(const RemoveOperation* left, const ChangeOperation* right) override;
    const Operation* OnSameValueChanged(const RemoveOperation* left,
                                        const ChangeMappingOperation* right) override;
    const Operation* OnSameValueRemoved(const RemoveOperation* left, const RemoveOperation* right) override;
    const Operation* OnSameMappingChanged(const ChangeMappingOperation* left,
                                          const ChangeMappingOperation* right) override;
    const Operation* OnSameSequenceChanged(const ChangeSequenceOperation* left,
                                           const ChangeSequenceOperation* right) override;
    /// Turns the record of the component's removal, if there is one, into a pending conflict.
    void OnComponentDependencyConflict(const ComponentDependencyConflict& conflict) override;

private:
    /// What becomes of a pair of operations: what enters the merge, and what the record says.
    struct Outcome {
        const Operation* operation;
        MergeResolve resolve;
    };

    std::optional<MergeResolve> FindResolve(const Path& path) const { return m_Resolves.Find(path); }
    /// Records what becomes of the property at the current path.
    void PushRecord(ConflictType type, MergeResolve resolve, const Operation* left, const Operation* right);
    /// The first record whose path is this id alone, or null.
    Record* FindObjectRecord(const YAMLScalar* fileID);
    const Operation* SingleSideResolve(const Operation* operation, ConflictType type);
    /// What a decision says of a pair; nothing where the pair is to be settled as if there were none.
    std::optional<Outcome> Decided(MergeResolve found, const Operation* left, const Operation* right) const;
    Outcome ConflictFallback(const Operation* left, const Operation* right, const Operation* pick) const;
    template <class Settle>
    const Operation* ResolvePair(ConflictType type, const Operation* left, const Operation* right,
                                 const Settle& settle);
    const Operation* ResolveRemoveAgainstChange(const RemoveOperation* left, const Operation* right);
    template <class Change, class MergeInside>
    const Operation* ResolveContainers(const Change* left, const Change* right, const MergeInside& merge);
    bool MayMergeInside(const Operation* left, const Operation* right) const;
    /// Merges two added containers as if both sides had filled an empty one. Null if nothing is left of them
    /// and the base is wanted at conflicts.
    const Operation* MergeAddedMappings(const AddOperation* left, const AddOperation* right);
    const Operation* MergeAddedSequences(const AddOperation* left, const AddOperation* right);

    std::vector<Record, HugePageAllocator<Record>> m_Records;
    std::unordered_map<const YAMLScalar*, std::size_t> m_ObjectRecords; // of the first m_IndexedRecords ones
    std::size_t m_IndexedRecords = 0;
    ResolveTable m_Resolves;
    DifferenceCheck m_DifferenceCheck; // of values that both sides added
    const MergeResolve m_DefaultResolve;
};

} // namespace ovrin_yaml
