#pragma once

#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"

#include <span>

namespace ovrin {

/// Looks into objects that may have any shape: whatever isn't there or isn't what it should be is null, and
/// nothing throws. Of a key that is repeated the first counts.

/// The value of `key`, or null if the node is no mapping or lacks it.
const ovrin_yaml::YAMLNode* FieldOf(const ovrin_yaml::YAMLNode* node, const ovrin_yaml::YAMLScalar* key);
/// The items of a list, or none.
std::span<ovrin_yaml::YAMLNode* const> ItemsOf(const ovrin_yaml::YAMLNode* node);

/// Where a value like `{fileID: 12}` or `{fileID: 12, guid: 4f0c..., type: 3}` leads.
struct Reference {
    const ovrin_yaml::YAMLScalar* fileID = nullptr; ///< null: the value is no reference
    const ovrin_yaml::YAMLScalar* guid = nullptr;   ///< null: into the same file

    bool IsNone() const;
};
Reference ReferenceOf(const ovrin_yaml::YAMLNode* node);
/// The object of the same file that a value refers to; null if there is none.
const ovrin_yaml::YAMLScalar* LocalReference(const ovrin_yaml::YAMLNode* node);

/// What an object is.
struct ObjectBody {
    const ovrin_yaml::YAMLScalar* className = nullptr; ///< null for an object without a body
    const ovrin_yaml::YAMLNode* fields = nullptr;
    bool isStripped = false;

    const ovrin_yaml::YAMLNode* Field(const ovrin_yaml::YAMLScalar* key) const {
        return FieldOf(fields, key);
    }
    bool IsGameObject() const { return className == ovrin_yaml::YAMLScalar::gameObject; }
    bool IsTransform() const;
    bool IsPrefabInstance() const;
};
ObjectBody BodyOf(const ovrin_yaml::YAMLNode* object);

/// The component that an entry of a GameObject's list names: `component: {fileID: 12}`, in older files
/// `4: {fileID: 12}`.
const ovrin_yaml::YAMLScalar* ComponentOf(const ovrin_yaml::YAMLNode* entry);
/// The prefab instance that an object says it comes from, or null.
const ovrin_yaml::YAMLScalar* InstanceOf(const ObjectBody& body);
/// The overrides of a prefab instance.
std::span<ovrin_yaml::YAMLNode* const> ModificationsOf(const ObjectBody& instance);

/// One of these overrides.
struct Override {
    Reference target; ///< the object in the prefab
    const ovrin_yaml::YAMLScalar* property = nullptr;
    const ovrin_yaml::YAMLNode* value = nullptr;

    bool IsName() const; ///< gives the object a name
};
Override OverrideOf(const ovrin_yaml::YAMLNode* modification);

} // namespace ovrin
