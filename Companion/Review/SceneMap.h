#pragma once

#include "Review/TreePages.h"
#include "Review/WorldPlaces.h"

#include <array>
#include <nlohmann/json_fwd.hpp>
#include <optional>
#include <vector>

namespace ovrin_yaml {
class MergeSession;
}

namespace ovrin {

/// From where a scene is looked at.
enum class MapView { Top, Side };

/// A part of the plane, its edges included.
struct MapBox {
    double x0 = 0, y0 = 0, x1 = 0, y1 = 0;
};

/// What a page asks a map for.
struct MapWish {
    MapView view = MapView::Top;
    std::optional<MapBox> box; ///< nothing: all
    std::size_t cells = 64;    ///< squares along an edge, at least 1
};

/// The GameObjects and prefab instances of all versions of a merge, drawn on a plane: from above x and z,
/// from the side x and y. An answer is bounded, however many stand there: each square of the box has an
/// object alone, or a bundle with the number of those in it. What was touched or is open, itself or a
/// component of it, is told singly besides, unless there are kMostTouched such in the box; then it is bundled
/// likewise. Every object of the box is told or counted exactly once.
///
/// An object stands where ours has it, or where theirs has it if they alone displaced it, else where base
/// has it. One of the touched is in the box if any version of it is.
class SceneMap {
public:
    static constexpr std::size_t kMostTouched = 1000, kMostCells = 128;

    /// Tree and pages must outlive the map; names are those of the session.
    SceneMap(const ovrin_yaml::MergeSession& session, const SceneTree& tree, const TreePages& pages,
             const MergeNames& names);

    ///     {"bounds": [x0, y0, x1, y1] of all, null where there is nothing,
    ///      "unplaced": places that no version has a position for,
    ///      "items": [{"id", "name", "mark", "by", "open", "base": [x, y] or null, "ours", "theirs"}],
    ///      "bundles": [{"x", "y", "count", "changed", "open", "box": [x0, y0, x1, y1]}]}
    ///
    /// A bundle stands in the middle of its objects, and its box is the smallest that holds them. Those are
    /// in the order of their squares, row by row; items in that of the tree, the touched first.
    nlohmann::json Draw(const MapWish& wish) const;

private:
    struct Thing {
        SceneTree::Index node;
        std::array<std::optional<Point>, 3> at; ///< in the order of Version
    };
    class Drawing;

    const SceneTree& m_Tree;
    const TreePages& m_Pages;
    std::vector<Thing> m_Things;
    std::size_t m_Unplaced = 0;
};

} // namespace ovrin
