#pragma once

#include <cstdint>

namespace ovrin_yaml {

class YAMLMapping;

/// What the repair stages want to know of an object before they look into it. Found when the object is read,
/// and again when it was changed, while it is at hand, so that they can pass over those that are of no
/// interest.
enum ObjectTrait : std::uint8_t {
    kTraitsKnown = 1,
    kHasTransitions = 2, ///< a state machine with transitions
    kHasPrefabLink = 4,  ///< somewhere in it is an m_PrefabInternal that isn't 0
    kIsTransform = 8,    ///< has the fields of a Transform or RectTransform
    kLacksFather = 16,   ///< these have no m_Father
    kLacksInstance = 32, ///< nor a link to the prefab instance that would know it
};

/// Finds the traits of an object. Throws the duplicate-keys YAMLError where it comes across a repeated key.
/// Called from any thread.
using ObjectInspector = std::uint8_t (*)(const YAMLMapping& object);

} // namespace ovrin_yaml
