#pragma once

#include "Names/MergeNames.h"
#include "Review/ObjectMark.h"

#include <cstdint>

namespace ovrin {

enum class NodeKind : std::uint8_t {
    Place,     ///< a GameObject or a prefab instance
    Component, ///< belongs to a place, stripped objects too
    Other
};

/// An object in a SceneTree.
struct MarkedNode {
    static constexpr std::uint32_t kTop = ~std::uint32_t{0};

    MergeNames::ID id = nullptr;
    std::uint32_t parent = kTop; ///< index of what it stands under
    std::uint32_t size = 1;      ///< nodes, itself and all below
    std::uint32_t open = 0;      ///< conflicts about the object itself
    std::uint32_t touchedBelow = 0, openBelow = 0;
    ObjectMark mark;
    NodeKind kind = NodeKind::Other;
    /// Where its name is read: in ours, unless only theirs changed it or has it.
    Version teller = Version::Ours;

    bool IsOfInterest() const { return mark.IsTouched() || open || touchedBelow || openBelow; }
};

/// The name of an object without that of what it stands under: "Lantern", "Light 2", "Material Rust".
std::string OwnLabel(const ObjectNames& names, MergeNames::ID id);

} // namespace ovrin
