#pragma once

#include "Diff/Operation.h"
#include "Values/Arena.h"
#include "Values/KeyIndex.h"
#include "Values/ObjectTrait.h"
#include "Values/TaskRunner.h"

#include <memory>
#include <vector>

namespace ovrin_yaml {

struct DiffContext;
class MergeRules;

/// The diff of two mappings: an operation for each key that differs, and how the order of the keys changed.
///
/// The order is data of its own, since a file must come out byte for byte as the editor would write it: the
/// list of keys is diffed, merged and applied like any sequence, with each key as its own element.
///
///     base keys a b c   destination keys c a d, a changed
///     entries     a: ChangeOperation   b: RemoveOperation   d: AddOperation
///     key order   remapper 1, -1, 0   count 3   operations 2: AddOperation("d")
///
/// A diff doesn't own its operations.
class YAMLMappingDiff {
public:
    struct Entry {
        const YAMLScalar* key;
        const Operation* operation;
    };
    using EntryList = std::vector<Entry, ArenaAllocator<Entry>>;

    /// The diff from `base` to `dest`, two hashed mappings at the path of `context`.
    static YAMLMappingDiff* Diff(DiffContext& context, const YAMLMapping* base, const YAMLMapping* dest);
    static YAMLMappingDiff* Diff(const MergeRules& rules, const YAMLMapping* base, const YAMLMapping* dest);

    /// Throws YAMLError "Cannot do a double change on the same key in a mapping".
    void Add(const YAMLScalar* key, const Operation* operation);
    bool HasKey(const YAMLScalar* key) const { return Find(key) != nullptr; }
    /// The operation for `key`, or null.
    const Operation* Find(const YAMLScalar* key) const;
    /// The index of `key` in Entries(), or KeyIndex::kMissing.
    std::uint32_t IndexOf(const YAMLScalar* key) const;
    /// In the order in which they were added; the position is the entry's index. Of a diff made by Diff: the
    /// changed and removed keys in base order, then the new ones in destination order.
    const EntryList& Entries() const { return m_Entries; }

    /// Changes `target`, which must equal the base of the diff. Throws YAMLError where it doesn't fit;
    /// `target` is then left halfway.
    void Apply(YAMLMapping& target) const { Apply(target, {}, nullptr); }
    /// The same for a root: objects are changed inside by `run`, and `inspect` finds their traits anew while
    /// they are at hand, where there are these.
    void Apply(YAMLMapping& target, const TaskRunner& run, ObjectInspector inspect) const;
    /// Whether applying it neither adds nor removes a key, nor moves one.
    bool LeavesKeys() const;

    /// How the key list changed. Set by every Diff, as an identity if it didn't; null in a diff made
    /// otherwise, where the order that applying the entries leaves is kept.
    const ChangeSequenceOperation* m_KeyOrder = nullptr;

    void ResetForAlloc() {}

private:
    void ApplyEntries(YAMLMapping& target, const TaskRunner& run, ObjectInspector inspect) const;

    EntryList m_Entries;
    std::unique_ptr<KeyIndex>
        m_Index; // positions in m_Entries, once there are more than KeyIndex::kSearchLimit
};

} // namespace ovrin_yaml
