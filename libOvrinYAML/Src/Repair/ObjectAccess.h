#pragma once

#include "Document/YAMLMapping.h"
#include "Document/YAMLScalar.h"
#include "Document/YAMLSequence.h"

#include <initializer_list>
#include <vector>

namespace ovrin_yaml {

/// The three roots that a repair looks at. Only the merged one changes.
struct RepairRoots {
    YAMLMapping& merged;
    const YAMLMapping& left;
    const YAMLMapping& right;

    /// Whether one side has an object `id` and the merge has not: somebody removed it.
    bool IsRemoved(const YAMLScalar* id) const;
};

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

/// Takes objects out of a root, each if it is there. Their trees are not given back.
void RemoveObjects(YAMLMapping& root, const std::vector<const YAMLScalar*>& ids);

/// Adds `node` and what stands below it to `found`, as far as it is a mapping and
/// wanted(const YAMLScalar* key, const YAMLMapping&) tells so; `key` is what the mapping stands under, null
/// for an item of a sequence. Every node is visited once. Throws the duplicate-keys YAMLError.
template <class Wanted>
void CollectMappings(const YAMLScalar* key, YAMLNode* node, const Wanted& wanted,
                     std::vector<YAMLMapping*>& found) {
    if (YAMLMapping* mapping = AsMapping(node)) {
        if (wanted(key, *mapping)) found.push_back(mapping);
        for (const YAMLMapping::Entry& entry : *mapping)
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
