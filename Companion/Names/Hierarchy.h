#pragma once

#include "Names/ObjectBody.h"

#include <cstdint>
#include <span>
#include <string>
#include <unordered_map>
#include <unordered_set>
#include <vector>

namespace ovrin {

/// What stands under what in one file. Places are GameObjects and prefab instances; all other objects of the
/// hierarchy, components and stripped objects, belong to one.
///
/// Only what is asked for is looked at, and found once. Nothing throws but std::bad_alloc. For one thread at
/// a time.
class Hierarchy {
public:
    using ID = const ovrin_yaml::YAMLScalar*;

    struct Place {
        ID id = nullptr;
        std::string label;             ///< its own name, printable and of bounded length
        const Place* parent = nullptr; ///< null for one at the top
        const Place* head = nullptr;   ///< itself, or the kHeadDepth-th place of the way to it
        std::uint32_t depth = 0;       ///< places above it
        ID missing = nullptr;          ///< of one at the top: what it claims to stand under, and isn't there
        bool isInLoop = false;         ///< of one at the top: it stands under itself
    };
    /// At this depth a path's beginning ends, of which every place below knows the last.
    static constexpr std::uint32_t kHeadDepth = 3;

    /// `root` is that of an OvrinObjects, and stays as it is. Its objects may have any shape.
    explicit Hierarchy(const ovrin_yaml::YAMLMapping& root) : m_Root(root) {}
    Hierarchy(const Hierarchy&) = delete;
    Hierarchy& operator=(const Hierarchy&) = delete;

    const ovrin_yaml::YAMLMapping& Root() const { return m_Root; }
    /// The object, the first of several of one id, or null.
    const ovrin_yaml::YAMLNode* Find(ID id) const;
    ObjectBody Body(ID id) const { return BodyOf(Find(id)); }

    /// The id of the place that an object is or belongs to: of a component its GameObject, of a stripped
    /// object its instance. Null for what belongs to none; what is returned need not be there.
    ID PlaceIDOf(const ObjectBody& body, ID id) const;
    /// The place of an id that is one.
    const Place& PlaceOf(ID id) const;
    /// Whether the object is a place.
    static bool IsPlace(const ObjectBody& body);

    /// How a component is told from others of its GameObject.
    struct Component {
        std::string label;          ///< class, and the first letters of the guid of a script
        unsigned number = 0;        ///< counted from 1 where the label repeats, else 0
        std::uint32_t position = 0; ///< in the GameObject's list
    };
    /// Null if the GameObject `owner` doesn't list the component.
    const Component* FindComponent(ID owner, ID component) const;
    /// Where a place stands in the list of children of the one above it; the greatest number if it isn't
    /// there.
    std::uint32_t PositionAmongChildren(const Place& place) const;

private:
    struct Holder {
        ID place = nullptr;
        ID missing = nullptr;
    };
    Holder HolderOf(const ovrin_yaml::YAMLNode* transformReference) const;
    Holder ParentOf(const ObjectBody& body) const;
    ID TransformOf(const ObjectBody& gameObject) const;
    const Place& Connect(std::span<Place* const> way, const Place* above) const;
    void NumberComponents(ID owner) const;
    void NumberChildren(ID place) const;

    const ovrin_yaml::YAMLMapping& m_Root;
    mutable std::unordered_map<ID, const ovrin_yaml::YAMLNode*>
        m_FirstOfID; // only of a root that repeats ids
    mutable std::unordered_map<ID, Place> m_Places;
    // By the owner and the component, so that one that two lists name has its place in both.
    struct Key {
        ID owner, part;
        bool operator==(const Key&) const = default;
    };
    struct KeyHash {
        std::size_t operator()(const Key& key) const;
    };
    mutable std::unordered_map<Key, Component, KeyHash> m_Components;
    mutable std::unordered_map<Key, std::uint32_t, KeyHash> m_Children;
    mutable std::unordered_set<ID> m_WithComponents, m_WithChildren; // places whose lists were looked at
};

} // namespace ovrin
