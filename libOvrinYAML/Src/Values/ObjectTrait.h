#pragma once

#include <cstdint>

namespace ovrin_yaml {

/// What the repair stages want to know of an object before they look into it. Found once, when the object is
/// read, so that they can pass over those that nobody changed and that are of no interest.
enum ObjectTrait : std::uint8_t {
    kTraitsKnown = 1,
    kHasTransitions = 2, ///< a state machine with transitions
    kHasPrefabLink = 4,  ///< somewhere in it is an m_PrefabInternal that isn't 0
    kIsTransform = 8,    ///< has the fields of a Transform or RectTransform
    kLacksFather = 16,   ///< these have no m_Father
    kLacksInstance = 32, ///< nor a link to the prefab instance that would know it
};

} // namespace ovrin_yaml
