#pragma once

#include "Names/Hierarchy.h"

#include <string>

namespace ovrin {

/// The names of the objects of one file, as a person knows them:
///
///     Harbour/Pier/Lantern                              a GameObject, by the parents of its Transform
///     Harbour/Pier/Lantern · Light                      a component
///     Harbour/Pier/Lantern · Light 2                    the second of several of its class
///     Harbour/Pier/Lantern · MonoBehaviour 4f0c2b7d     a script, by the first letters of its guid
///     Harbour/Pier/Lantern · MonoBehaviour 4f0c2b7d 2   the second of several of one script
///     Harbour/Boat                                      a prefab instance, by the name among its overrides
///     Harbour/PrefabInstance c5a81f3e                   one without, by the guid of its source
///     Harbour/Boat · Transform                          a stripped object, by its instance
///     Material Rust                                     anything else, by class and name
///
/// Where the file is damaged the name says so: "(missing 12)" for an object that isn't there, "(no name)" for
/// a blank name, "(loop)/A" where A is above itself. Names are printable (Names/PrintableText.h) and have a
/// bounded length: of a path of many parents the middle is left out, "A/B/…/Y/Z". So different objects may
/// have one name; the id tells them apart.
///
/// A name is made when it is asked for, from what it is made of and nothing else, in time linear in the
/// parents that no earlier name went through. Nothing throws but std::bad_alloc. For one thread at a time.
class ObjectNames {
public:
    using ID = const ovrin_yaml::YAMLScalar*;

    /// `root` is that of an OvrinObjects; it must stay as it is as long as names are asked for. Its objects
    /// may have any shape.
    explicit ObjectNames(const ovrin_yaml::YAMLMapping& root) : m_Hierarchy(root) {}

    /// A name in its parts.
    struct Parts {
        std::string place;   ///< "Harbour/Pier/Lantern"; of an object outside of the hierarchy its whole name
        std::string part;    ///< "Light"; empty for what is a place itself
        unsigned number = 0; ///< 2; 0 where the part doesn't repeat

        std::string Text() const;
    };
    Parts NameOf(ID id) const;
    /// "Harbour/Pier/Lantern · Light 2".
    std::string Name(ID id) const { return NameOf(id).Text(); }
    /// "Harbour/Pier/Lantern · Light 2 (734813)".
    std::string NameWithID(ID id) const;

    bool Has(ID id) const { return m_Hierarchy.Find(id) != nullptr; }
    /// The object, or null.
    const ovrin_yaml::YAMLNode* Find(ID id) const { return m_Hierarchy.Find(id); }
    /// What the object stands under: the GameObject or prefab instance above a GameObject or prefab instance,
    /// the GameObject of a component, the instance of a stripped object. Null for what stands under nothing,
    /// or under something that isn't there. Going up always ends.
    ID Above(ID id) const;

    const Hierarchy& Places() const { return m_Hierarchy; }

private:
    std::string PathOf(ID id) const;

    Hierarchy m_Hierarchy;
};

} // namespace ovrin
