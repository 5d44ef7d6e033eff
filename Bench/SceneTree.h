#pragma once

#include "SceneObjects.h"

#include <optional>

namespace ovrin_bench {

enum Side { Left, Right };

/// One object on its way into the three files.
struct SceneSlot {
    enum class Claim { Free, Left, Right, Conflict };

    SceneObject object;                   ///< as the base has it; an added object: as its side has it
    std::optional<SceneObject> edited[2]; ///< by side: the object with that side's edits
    bool inBase = true;
    bool present[2] = {true, true}; ///< by side
    Claim claim = Claim::Free;      ///< whose edits alone may touch the object

    /// The object as the side has it, to be changed.
    SceneObject& Edit(Side side);
};

/// A game object with its transform and other components. All members are slot indexes, `parent` an entity
/// index.
struct SceneEntity {
    std::size_t gameObject = 0;
    std::size_t transform = 0;
    std::vector<std::size_t> components; ///< without the transform
    std::size_t parent = 0;              ///< the root entity is its own parent
    bool hasChildren = false;
};

/// A few dozen objects that refer to each other and to nothing else in the scene: what is generated, edited
/// and written in one piece, so that memory doesn't grow with the scene. Entity 0 is the root.
struct SceneTree {
    std::vector<SceneSlot> slots; ///< in file order
    std::vector<SceneEntity> entities;
};

/// A tree of up to `mostEntities` entities; at least 1.
SceneTree MakeTree(SceneRandom& random, SceneIDs& ids, std::uint64_t mostEntities);

/// Appends a MonoBehaviour that only `side` has to an entity, its place in the game object's list included.
void AddComponent(SceneTree& tree, std::size_t entity, Side side, SceneRandom& random, SceneIDs& ids);
/// Appends a child entity that only `side` has.
void AddChild(SceneTree& tree, std::size_t entity, Side side, SceneRandom& random, SceneIDs& ids);
/// Takes an entity without children from one side.
void RemoveLeaf(SceneTree& tree, std::size_t entity, Side side);
/// Makes the root the parent of an entity on one side.
void MoveToRoot(SceneTree& tree, std::size_t entity, Side side);

} // namespace ovrin_bench
