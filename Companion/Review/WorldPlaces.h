#pragma once

#include "Names/ObjectNames.h"
#include "Review/Affine.h"

#include <unordered_map>
#include <vector>

namespace ovrin {

/// Where the GameObjects and prefab instances of one version of a scene stand in its world: by the Transforms
/// above them, with rotations and scales.
///
/// Objects may have any shape. What stands under something that isn't there, or goes round in a loop, counts
/// as standing at the top; what has a number that is none, or stands under such, has no place.
class WorldPlaces {
public:
    using ID = ObjectNames::ID;

    explicit WorldPlaces(const ObjectNames& names);

    /// Null for what has no place.
    const Point* Find(ID place) const;

private:
    /// A Transform or instance on the way to its place in the world.
    struct Frame {
        ID id;
        ID parentID;
        Affine frame; ///< within the parent, then in the world
        enum class State : unsigned char { New, OnTheWay, Done } state = State::New;
    };
    class Frames;

    std::unordered_map<ID, Point> m_Points;
};

} // namespace ovrin
