#pragma once

#include "Values/TaskRunner.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"

#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <unordered_set>
#include <vector>

namespace ovrin_yaml {

/// The three roots that a repair looks at. Only the merged one changes. `run` is for what can be done for
/// many objects at once.
struct RepairRoots {
    RepairRoots(YAMLMapping& merged, const YAMLMapping& left, const YAMLMapping& right, TaskRunner run = {});

    YAMLMapping& merged;
    const YAMLMapping& left;
    const YAMLMapping& right;
    const TaskRunner run;
    /// The objects that a side has and the merge has not: somebody removed them.
    std::unordered_set<const YAMLScalar*> removed;

    bool IsRemoved(const YAMLScalar* id) const { return removed.contains(id); }
    /// Takes objects out of the merged root, each if it is there. Their trees are not given back.
    void RemoveObjects(const std::vector<const YAMLScalar*>& ids);
};

/// Calls visit(id, value) in file order for the objects of a root that are of interest: byTree(id, value)
/// tells, but an object that has traits (YAMLMapping::Traits) may be told to be of none by
/// byTraits(const YAMLMapping&) first, and one that is unbuilt is asked no more than that.
///
/// All are asked for ahead of the first visit, many at once where there is a `run`. One whose question throws
/// a YAMLError is visited, so that the first failure in file order is the one that is thrown; a YAMLError of
/// a visit learns of the object.
template <class ByTraits, class ByTree, class Visit>
void ForEachObject(const YAMLMapping& root, const TaskRunner& run, const ByTraits& byTraits,
                   const ByTree& byTree, const Visit& visit) {
    // The objects lie far from each other in memory: ask for those that come next.
    constexpr std::size_t kAhead = 8, kGroupSize = 4096;
    root.RequireNormalState();
    const auto entries = root.RawEntries();
    const auto isOfInterest = [&](const YAMLMapping::Entry& entry) {
        const YAMLMapping* object = AsMapping(entry.value);
        if (object && object->Traits() && !byTraits(*object)) return false;
        return (object && !object->IsBuilt()) || byTree(entry.key, entry.value);
    };
    std::vector<std::uint8_t> isWanted(entries.size());
    RunInGroups(run, entries.size(), kGroupSize, [&](std::size_t first, std::size_t end) {
        for (std::size_t i = first; i < end; ++i) {
            if (i + kAhead < end) __builtin_prefetch(entries[i + kAhead].value);
            try {
                isWanted[i] = entries[i].key && isOfInterest(entries[i]);
            } catch (const YAMLError&) {
                isWanted[i] = true;
            }
        }
    });
    for (std::size_t i = 0; i < entries.size(); ++i) {
        if (!isWanted[i]) continue;
        const auto& [id, value] = entries[i];
        try {
            visit(id, value);
        } catch (YAMLError& error) {
            error.SetPlace(id->Value());
            throw;
        }
    }
}

/// The scalar at the end of a path of keys. Null if a key is missing, if the mapping or a value on the way is
/// null or no mapping, or if the last value is no scalar.
const YAMLScalar* GetMappingPath(const YAMLMapping* mapping, std::initializer_list<const YAMLScalar*> keys);

/// Whether a reference names no object: there is none (null), or it is 0 or empty.
bool IsNoReference(const YAMLScalar* id);

/// Whether the root has an object `id`, which may be null.
bool HasObject(const YAMLMapping& root, const YAMLScalar* id);

/// The Transform part of an object.
struct TransformFields {
    const YAMLScalar* classKey = nullptr; // Transform or RectTransform
    const YAMLMapping* fields = nullptr;  // null: the object is no Transform, or its body is no mapping
};

/// The Transform part of a root's value.
TransformFields GetTransform(const YAMLNode* object);

/// The object `id` of a root, to be changed. Every change inside an object begins here, and only when there
/// is one to make. Pointers into the object that were got before must not be used any more.
/// Throws std::bad_cast if the value is no mapping.
YAMLMapping& Editable(YAMLMapping& root, const YAMLScalar* id);

/// Points the reference `field`, a mapping with a fileID among the fields of the class `classKey`, at
/// `target`.
void SetReference(YAMLMapping& root, const YAMLScalar* id, const YAMLScalar* classKey,
                  const YAMLScalar* field, const YAMLScalar* target);

/// Adds `node` and what stands below it to `found`, as far as it is a mapping and
/// wanted(const YAMLScalar* key, const YAMLMapping&) tells so; `key` is what the mapping stands under, null
/// for an item of a sequence. Every node is visited once. Throws the duplicate-keys YAMLError.
template <class Wanted>
void CollectMappings(const YAMLScalar* key, YAMLNode* node, const Wanted& wanted,
                     std::vector<YAMLMapping*>& found) {
    if (YAMLMapping* mapping = AsMapping(node)) {
        if (wanted(key, *mapping)) found.push_back(mapping);
        for (const YAMLMapping::Entry entry : *mapping)
            if (!AsScalar(entry.value)) CollectMappings(entry.key, entry.value, wanted, found);
    } else if (YAMLSequence* sequence = AsSequence(node)) {
        for (YAMLNode* item : sequence->m_Items) CollectMappings(nullptr, item, wanted, found);
    }
}

/// The mappings that CollectMappings finds.
template <class Wanted>
std::vector<YAMLMapping*> FindMappings(const YAMLScalar* key, YAMLNode* node, const Wanted& wanted) {
    std::vector<YAMLMapping*> found;
    CollectMappings(key, node, wanted, found);
    return found;
}

} // namespace ovrin_yaml
