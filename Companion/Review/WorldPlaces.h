#pragma once

#include "Names/ObjectNames.h"
#include "Review/Affine.h"

#include <cstdint>
#include <unordered_map>
#include <vector>

namespace ovrin_yaml {
class YAMLMappingDiff;
}

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
    /// Of a version that `diff` makes of another one, whose places are known: only what it touches is read.
    WorldPlaces(const WorldPlaces& before, const ovrin_yaml::YAMLMappingDiff& diff, const ObjectNames& after);

    /// Null for what has no place.
    const Point* Find(ID place) const;

private:
    /// A Transform or instance.
    struct Part {
        ID id;
        ID parent;    ///< null at the top
        ID place;     ///< the GameObject or instance that stands where it stands; null for none
        Affine frame; ///< within the parent
        bool isGone = false;
    };
    class Frames;
    void Read(ID id, const ObjectNames& names);
    void Place();

    std::vector<Part> m_Parts;
    std::unordered_map<ID, std::uint32_t> m_Indexes; // of the parts
    std::unordered_map<ID, Point> m_Points;
};

} // namespace ovrin
