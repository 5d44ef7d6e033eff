#pragma once

#include "Values/YAMLMapping.h"

#include <cstdint>

namespace ovrin_yaml {

/// What the repair stages want to know of an object before they look into it. Found once, right after the
/// object was read, so that they can pass over those that nobody changed and that are of no interest.
enum ObjectTrait : std::uint8_t {
    kTraitsKnown = 1,
    kHasTransitions = 2, ///< a state machine with transitions
    kHasPrefabLink = 4,  ///< somewhere in it is an m_PrefabInternal that isn't 0
    kIsTransform = 8,    ///< has the fields of a Transform or RectTransform
    kLacksFather = 16,   ///< these have no m_Father
};

/// The traits of an object, which must not repeat a key anywhere.
std::uint8_t InspectObject(const YAMLMapping& object);

/// Whether a mapping that stands under `key` is a prefab link with a target, even if that is empty.
bool IsPrefabLink(const YAMLScalar* key, const YAMLMapping& mapping);

/// The transitions of an object that is a state machine, or null.
const YAMLNode* TransitionsOf(const YAMLMapping& object);

} // namespace ovrin_yaml
