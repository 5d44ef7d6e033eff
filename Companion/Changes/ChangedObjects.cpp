#include "Changes/ChangedObjects.h"

#include "Diff/YAMLMappingDiff.h"

#include <algorithm>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

using ID = ObjectNames::ID;

bool IsIn(ID key, std::initializer_list<const char*> names) {
    return std::ranges::any_of(names, [key](const char* name) { return key->Value() == name; });
}

bool IsPlaceIn(const ObjectNames& names, ID id) {
    return Hierarchy::IsPlace(names.Places().Body(id));
}

/// Whether an operation changes a value outside of lists, and of what a move changes.
bool IsTold(const Operation& operation) {
    const auto* change = As<ChangeMappingOperation>(&operation);
    if (!change) return !As<ChangeSequenceOperation>(&operation);
    return std::ranges::any_of(change->m_Diff->Entries(), [](const YAMLMappingDiff::Entry& entry) {
        return !IsIn(entry.key, {"m_Father", "m_Modification"}) && IsTold(*entry.operation);
    });
}

} // namespace

ChangedObjects::ChangedObjects(const ObjectNames& before, const ObjectNames& after,
                               const YAMLMappingDiff& diff, const MergeRules& rules, std::size_t width)
    : m_Before(before), m_After(after), m_Diff(diff), m_Properties(before, after, rules, width) {
    for (const auto& [id, operation] : m_Diff.Entries()) FindMove(id, *operation);
}

/// What is moved is the GameObject or instance, what changed is its Transform.
void ChangedObjects::FindMove(ID id, const Operation& operation) {
    if (!As<ChangeMappingOperation>(&operation)) return;
    const ObjectBody body = m_After.Places().Body(id);
    if (!body.IsTransform() && !body.IsPrefabInstance()) return;
    const ID place = m_After.Places().PlaceIDOf(body, id);
    if (!place || !IsPlaceIn(m_Before, place) || !IsPlaceIn(m_After, place)) return;
    const ID former = m_Before.Above(place);
    if (former != m_After.Above(place)) m_FormerParents.emplace(place, former);
}

std::vector<ID> ChangedObjects::Candidates() const {
    std::vector<ID> ids;
    ids.reserve(m_Diff.Entries().size());
    for (const auto& entry : m_Diff.Entries()) ids.push_back(entry.key);
    for (const auto& [id, parent] : m_FormerParents)
        if (!m_Diff.HasKey(id)) ids.push_back(id);
    return ids;
}

std::optional<ChangedObjects::Change> ChangedObjects::Find(ID id) {
    const Operation* operation = m_Diff.Find(id);
    Change change{ChangeKind::Moved};
    if (const auto moved = m_FormerParents.find(id); moved != m_FormerParents.end()) {
        change.isMoved = true;
        change.formerParent = moved->second;
    }
    if (As<AddOperation>(operation))
        change.kind = ChangeKind::Added;
    else if (As<RemoveOperation>(operation))
        change.kind = ChangeKind::Removed;
    else if (operation && ChangesProperty(id, *operation))
        change.kind = ChangeKind::Changed;
    else if (!change.isMoved)
        return std::nullopt;
    return change;
}

/// Most changes have a value that surely is told; the others are looked into.
bool ChangedObjects::ChangesProperty(ID id, const Operation& operation) {
    return IsTold(operation) || !Properties(id).empty();
}

std::vector<PropertyChange> ChangedObjects::Properties(ID id) {
    const Operation* operation = m_Diff.Find(id);
    if (!operation) return {};
    std::vector<PropertyChange> properties = m_Properties.List(
        id, *operation, [&](ID list, const YAMLNode* item) { return IsToldElsewhere(list, item); });
    if (m_FormerParents.contains(m_After.Places().PlaceIDOf(m_After.Places().Body(id), id)))
        std::erase_if(properties, [](const PropertyChange& property) {
            return property.place == "m_Father" || property.place == "m_Modification.m_TransformParent";
        });
    return properties;
}

/// Whether an element of a list of components or children came or went with its object.
bool ChangedObjects::IsToldElsewhere(ID list, const YAMLNode* item) const {
    if (!IsIn(list, {"m_Component", "m_Children"})) return false;
    ID id = LocalReference(item);
    if (!id) id = ComponentOf(item);
    if (!id) return false;
    const Operation* operation = m_Diff.Find(id);
    if (As<AddOperation>(operation) || As<RemoveOperation>(operation)) return true;
    const Hierarchy& places = m_After.Places();
    return m_FormerParents.contains(places.PlaceIDOf(places.Body(id), id));
}

} // namespace ovrin
