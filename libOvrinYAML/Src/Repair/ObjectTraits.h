#pragma once

#include "Values/ObjectTrait.h"
#include "Values/YAMLMapping.h"

#include <cstdint>

namespace ovrin_yaml {

/// The traits (ObjectTrait) of an object. Throws the duplicate-keys YAMLError for a repeated key, unless it
/// found a prefab link before.
std::uint8_t InspectObject(const YAMLMapping& object);

/// Whether a mapping that stands under `key` is a prefab link with a target, even if that is empty.
bool IsPrefabLink(const YAMLScalar* key, const YAMLMapping& mapping);

/// The file id of the prefab instance that a stripped Transform with these fields stands for, or null.
const YAMLScalar* InstanceOf(const YAMLMapping& fields);

/// The transitions of an object that is a state machine, or null.
const YAMLNode* TransitionsOf(const YAMLMapping& object);

} // namespace ovrin_yaml
