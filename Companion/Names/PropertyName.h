#pragma once

#include "Names/ObjectNames.h"

#include "Diff/MergeRules.h"

#include <span>
#include <string>
#include <unordered_map>
#include <utility>

namespace ovrin {

/// Adds a step into a mapping to the words for a place: "m_LocalPosition" and "x" become "m_LocalPosition.x".
void AddKey(std::string& place, const ovrin_yaml::YAMLScalar* key);
/// Adds a step into a list: "m_Slots" and "left hand" become "m_Slots[left hand]".
void AddElement(std::string& place, const std::string& element);

/// The words for places within the objects of one file:
///
///     m_LocalPosition.x
///     m_Materials[2]                       an element without a key, by its index, counted from 0
///     m_Children[Harbour/Lantern]          by the object that its key names
///     m_Component[Light 2]                 in short where that belongs to the object itself
///     m_Modifications[Lantern · m_Name]    an override, by the object in the prefab and the property
///     m_Slots[left hand].item              by the values of its keys
///
/// Printable. For one thread at a time.
class PropertyNames {
public:
    using ID = ObjectNames::ID;

    /// Both must outlive the names.
    PropertyNames(const ObjectNames& names, const ovrin_yaml::MergeRules& rules)
        : m_Names(names), m_Rules(rules) {}

    /// `path` is the object's id, its class, then keys and indexes as they stand in the file. Empty for the
    /// object as a whole. What the file hasn't is told by its key or index.
    std::string Name(std::span<const ID> path) const;

    /// What stands between the brackets for an item of the list at `listPath`: its key, or else `index`.
    std::string ElementName(std::span<const ID> listPath, const ovrin_yaml::YAMLNode* list,
                            const ovrin_yaml::YAMLNode* item, ID index) const;

private:
    std::string KeyName(ID owner, const ovrin_yaml::YAMLNode* list, const ovrin_yaml::YAMLNode* item,
                        const ovrin_yaml::Path& key) const;
    std::string ReferenceName(ID owner, const ovrin_yaml::YAMLNode* list, const Reference& reference) const;

    using Target = std::pair<ID, ID>; // file id and guid
    struct TargetHash {
        std::size_t operator()(const Target& target) const;
    };
    /// The names that a list of overrides gives to the objects of its prefab.
    using TargetNames = std::unordered_map<Target, std::string, TargetHash>;
    const TargetNames& NamesWithin(const ovrin_yaml::YAMLNode* list) const;

    const ObjectNames& m_Names;
    const ovrin_yaml::MergeRules& m_Rules;
    mutable std::unordered_map<const ovrin_yaml::YAMLNode*, TargetNames> m_TargetNames;
};

} // namespace ovrin
