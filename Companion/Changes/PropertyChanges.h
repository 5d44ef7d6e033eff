#pragma once

#include "Changes/SceneChange.h"
#include "Names/PropertyName.h"

#include "Diff/Operation.h"

#include <functional>

namespace ovrin {

/// Lists what changed within objects, property by property.
class PropertyChanges {
public:
    using ID = ObjectNames::ID;

    /// The two versions and the rules that they were compared by.
    PropertyChanges(const ObjectNames& before, const ObjectNames& after, const ovrin_yaml::MergeRules& rules,
                    std::size_t width);

    /// Asked of each element that a list gained or lost, with the key of the list: whether what it refers to
    /// is told elsewhere, so that it needs no word.
    using IsToldElsewhere =
        std::function<bool(const ovrin_yaml::YAMLScalar* list, const ovrin_yaml::YAMLNode* item)>;

    /// The changes that an operation made to an object.
    std::vector<PropertyChange> List(ID id, const ovrin_yaml::Operation& operation,
                                     const IsToldElsewhere& isToldElsewhere);
    /// The fields of an object in one version, as added or removed.
    std::vector<PropertyChange> Fields(ID id, ChangeKind kind);

private:
    using Node = ovrin_yaml::YAMLNode;

    void Walk(const ovrin_yaml::Operation& operation, const Node* before, const Node* after);
    void WalkMapping(const ovrin_yaml::ChangeMappingOperation& change, const Node* before, const Node* after);
    void WalkList(const ovrin_yaml::ChangeSequenceOperation& change, const Node* before, const Node* after);
    void TellMoves(const std::vector<int>& targets, const Node* after);
    void TellElement(ChangeKind kind, const Node* list, int index);
    void Tell(ChangeKind kind, const Node* before, const Node* after);
    void IntoKey(ID key, const std::function<void()>& visit);
    void IntoElement(const PropertyNames& properties, const Node* list, int index,
                     const std::function<void()>& visit);
    std::string Text(const Node* value, const ObjectNames& names) const;

    const ObjectNames& m_Before;
    const ObjectNames& m_After;
    const PropertyNames m_PropertiesBefore, m_PropertiesAfter;
    const std::size_t m_Width;
    const IsToldElsewhere* m_IsToldElsewhere = nullptr;
    // Where the walk stands.
    ovrin_yaml::Path m_Path;
    std::string m_Place;
    std::vector<PropertyChange> m_Found;
};

} // namespace ovrin
