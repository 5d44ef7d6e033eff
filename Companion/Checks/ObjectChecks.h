#pragma once

#include "Checks/FindingCodes.h"
#include "Checks/Outline.h"

#include "Repair/YAMLTypeInfo.h"

#include <cstddef>
#include <cstdint>
#include <vector>

namespace ovrin {

/// What is wrong with an object, before it is put into words.
struct ObjectFault {
    Code code;
    std::size_t object;                            ///< among the outlines
    std::uint32_t line = 0;                        ///< from that of the object's document, which is 0
    const ovrin_yaml::YAMLScalar* field = nullptr; ///< the field or key that it is about
    const ovrin_yaml::YAMLScalar* other = nullptr; ///< the other object's id, or the missing one's class id
    std::size_t number = 0;                        ///< of objects in a loop
};

/// Looks at the objects of a scene and at what they say of each other, on all processors. The faults come in
/// the order of the objects, those of one object by line and code. Time is linear in what the objects hold,
/// whatever they refer to.
std::vector<ObjectFault> CheckObjects(const Outlines& outlines, const ovrin_yaml::YAMLTypeInfoManager& types);

} // namespace ovrin
