#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace ovrin_yaml {
class MergeSession;
}

namespace ovrin {

enum class ChangeKind {
    Added,
    Removed,
    Changed,
    Moved, ///< of an element of a list: to another index; of an object: to another parent, and nothing else
};

/// What changed at a place within an object.
struct PropertyChange {
    std::string place; ///< as in Names/PropertyName.h; empty for the object as a whole
    ChangeKind kind;
    std::string before, after; ///< the values, as in Names/ValueText.h; indexes of what moved
};

/// What changed about an object.
struct ObjectChange {
    std::string id;
    std::string name; ///< without the id; that of the old scene if the object was removed
    ChangeKind kind;
    bool isMoved = false;     ///< stands under another parent
    std::string formerParent; ///< of what moved: the name of the parent it had; empty at the top
    std::vector<PropertyChange> properties;
};

/// What changed from one version of a scene to another, object by object in the hierarchy's order.
///
/// What follows from another change isn't told again: that an added, removed or moved object appears in or
/// goes from the list of its parent.
struct SceneChange {
    std::vector<ObjectChange> objects;
    std::size_t added = 0, removed = 0, changed = 0,
                moved = 0; ///< objects; moved ones may be changed as well
};

/// What changed from the base to the left side of a session of two files that has come as far as Diff. Values
/// are shortened to `width` characters, unless that is 0. With `withValues` the fields of added and removed
/// objects are told as well.
SceneChange ListChanges(ovrin_yaml::MergeSession& session, std::size_t width, bool withValues);

} // namespace ovrin
