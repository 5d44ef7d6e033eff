#include "Names/ObjectBody.h"

#include "Values/OvrinObjects.h"

namespace ovrin {

using namespace ovrin_yaml;

const YAMLNode* FieldOf(const YAMLNode* node, const YAMLScalar* key) {
    const YAMLMapping* mapping = AsMapping(node);
    if (!mapping) return nullptr;
    if (!mapping->HasDuplicates()) return mapping->Get(key);
    for (const YAMLMapping::Entry entry : mapping->RawEntries())
        if (entry.key == key) return entry.value;
    return nullptr;
}

std::span<YAMLNode* const> ItemsOf(const YAMLNode* node) {
    const YAMLSequence* sequence = AsSequence(node);
    if (!sequence) return {};
    return {sequence->m_Items.data(), sequence->m_Items.size()};
}

bool Reference::IsNone() const {
    return fileID == YAMLScalar::zero || fileID == YAMLScalar::empty;
}

Reference ReferenceOf(const YAMLNode* node) {
    const YAMLScalar* guid = AsScalar(FieldOf(node, YAMLScalar::guid));
    return {AsScalar(FieldOf(node, YAMLScalar::fileID)), guid == YAMLScalar::empty ? nullptr : guid};
}

const YAMLScalar* LocalReference(const YAMLNode* node) {
    const Reference reference = ReferenceOf(node);
    return reference.guid || reference.IsNone() ? nullptr : reference.fileID;
}

bool ObjectBody::IsTransform() const {
    return className == YAMLScalar::transform || className == YAMLScalar::rectTransform;
}

bool ObjectBody::IsPrefabInstance() const {
    return !isStripped && (className == YAMLScalar::prefabInstance || className == YAMLScalar::prefab);
}

ObjectBody BodyOf(const YAMLNode* object) {
    const YAMLMapping* mapping = AsMapping(object);
    if (!mapping) return {};
    ObjectBody body;
    for (const YAMLMapping::Entry entry : mapping->RawEntries()) {
        if (!entry.key || IsPlaceHolderKey(entry.key)) continue;
        body.className = entry.key;
        body.fields = entry.value;
        break;
    }
    body.isStripped = FieldOf(object, YAMLScalar::strippedPrefabPlaceHolderName) != nullptr;
    return body;
}

const YAMLScalar* ComponentOf(const YAMLNode* entry) {
    const YAMLMapping* mapping = AsMapping(entry);
    if (!mapping) return nullptr;
    for (const YAMLMapping::Entry pair : mapping->RawEntries())
        if (pair.key) return LocalReference(pair.value);
    return nullptr;
}

const YAMLScalar* InstanceOf(const ObjectBody& body) {
    for (const YAMLScalar* key :
         {YAMLScalar::mPrefabInstance, YAMLScalar::mPrefabInternal, YAMLScalar::mPrefab})
        if (const YAMLScalar* instance = LocalReference(body.Field(key))) return instance;
    return nullptr;
}

std::span<YAMLNode* const> ModificationsOf(const ObjectBody& instance) {
    static const YAMLScalar* const key = YAMLScalar::Lookup("m_Modifications");
    return ItemsOf(FieldOf(instance.Field(YAMLScalar::mModification), key));
}

bool Override::IsName() const {
    static const YAMLScalar* const name = YAMLScalar::Lookup("m_Name");
    return property == name;
}

Override OverrideOf(const YAMLNode* modification) {
    static const YAMLScalar* const target = YAMLScalar::Lookup("target");
    static const YAMLScalar* const propertyPath = YAMLScalar::Lookup("propertyPath");
    static const YAMLScalar* const value = YAMLScalar::Lookup("value");
    return {ReferenceOf(FieldOf(modification, target)), AsScalar(FieldOf(modification, propertyPath)),
            FieldOf(modification, value)};
}

} // namespace ovrin
