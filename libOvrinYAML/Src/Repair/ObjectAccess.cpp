#include "Repair/ObjectAccess.h"

namespace ovrin_yaml {

bool RepairRoots::IsRemoved(const YAMLScalar* id) const {
    return !HasObject(merged, id) && (HasObject(left, id) || HasObject(right, id));
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

void RemoveObjects(YAMLMapping& root, const std::vector<const YAMLScalar*>& ids) {
    for (const YAMLScalar* id : ids) root.Steal(id);
}

} // namespace ovrin_yaml
