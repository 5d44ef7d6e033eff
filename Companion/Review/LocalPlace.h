#pragma once

#include "Names/ObjectNames.h"
#include "Review/Affine.h"

namespace ovrin {

/// Where an object stands within another.
struct LocalPlace {
    ObjectNames::ID parent = nullptr; ///< a Transform or prefab instance; null at the top
    Affine frame;                     ///< not finite where a number of the object is none
};

/// Whether an object has a place of its own: a Transform or a prefab instance, stripped ones too.
bool HasPlace(const ObjectBody& body);

/// The place of such an object: of a Transform by its own fields, what it lacks being that of no
/// displacement, of an instance by the overrides of the first object that it displaces, and of a stripped
/// Transform that of its instance, since the scene knows no more. Whether the parent is there is not looked
/// at.
LocalPlace LocalPlaceOf(const ObjectBody& body);

} // namespace ovrin
