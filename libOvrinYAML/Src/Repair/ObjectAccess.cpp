#include "Repair/ObjectAccess.h"

#include "Values/AlignedLookup.h"

#include <utility>

namespace ovrin_yaml {

RepairRoots::RepairRoots(YAMLMapping& mergedRoot, const YAMLMapping& leftRoot, const YAMLMapping& rightRoot,
                         TaskRunner runner)
    : merged(mergedRoot), left(leftRoot), right(rightRoot), run(std::move(runner)) {
    for (const YAMLMapping* side : {&left, &right}) {
        AlignedLookup survivors(merged);
        for (const auto& [id, object] : *side)
            if (!survivors.Get(id)) removed.insert(id);
    }
}

void RepairRoots::RemoveObjects(const std::vector<const YAMLScalar*>& ids) {
    for (const YAMLScalar* id : ids) {
        merged.Steal(id);
        if (left.HasKey(id) || right.HasKey(id)) removed.insert(id);
    }
}

const YAMLScalar* GetMappingPath(const YAMLMapping* mapping, std::initializer_list<const YAMLScalar*> keys) {
    const YAMLNode* node = mapping;
    for (const YAMLScalar* key : keys) {
        mapping = AsMapping(node);
        if (!mapping) return nullptr;
        node = mapping->Get(key);
    }
    return AsScalar(node);
}

bool IsNoReference(const YAMLScalar* id) {
    return !id || id == YAMLScalar::zero || id == YAMLScalar::empty;
}

bool HasObject(const YAMLMapping& root, const YAMLScalar* id) {
    return id && root.HasKey(id);
}

TransformFields GetTransform(const YAMLNode* object) {
    const YAMLMapping* mapping = AsMapping(object);
    if (!mapping) return {};
    for (const YAMLScalar* classKey : {YAMLScalar::transform, YAMLScalar::rectTransform})
        if (const YAMLNode* fields = mapping->Get(classKey)) return {classKey, AsMapping(fields)};
    return {};
}

YAMLMapping& Editable(YAMLMapping& root, const YAMLScalar* id) {
    root.GetRef(id);
    return ToMapping(root.GetForChange(id));
}

void SetReference(YAMLMapping& root, const YAMLScalar* id, const YAMLScalar* classKey,
                  const YAMLScalar* field, const YAMLScalar* target) {
    YAMLMapping& fields = ToMapping(Editable(root, id).GetRef(classKey));
    ToMapping(fields.GetRef(field)).Change(YAMLScalar::fileID, target->Clone());
}

} // namespace ovrin_yaml
