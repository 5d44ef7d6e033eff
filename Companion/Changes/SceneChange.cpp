#include "Changes/SceneChange.h"

#include "Changes/PropertyChanges.h"
#include "Names/HierarchyOrder.h"
#include "Names/PrintableText.h"

#include "Diff/YAMLMappingDiff.h"
#include "Session/MergeSession.h"

#include <algorithm>
#include <unordered_map>
#include <unordered_set>
#include <utility>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

using ID = ObjectNames::ID;

bool IsIn(ID key, std::initializer_list<const char*> names) {
    return std::ranges::any_of(names, [key](const char* name) { return key->Value() == name; });
}

class Lister {
public:
    Lister(MergeSession& session, std::size_t width, bool withValues)
        : m_Before(session.BaseObjects().GetMapping()), m_After(session.LeftObjects().GetMapping()),
          m_Diff(session.LeftDiff()), m_Properties(m_Before, m_After, session.Rules(), width),
          m_WithValues(withValues) {
        for (const auto& [id, operation] : m_Diff.Entries()) FindMove(id, *operation);
    }

    SceneChange List() {
        std::vector<ID> ids;
        for (const auto& entry : m_Diff.Entries()) ids.push_back(entry.key);
        for (const auto& [id, parent] : m_FormerParents)
            if (!m_Diff.HasKey(id)) ids.push_back(id);
        const ObjectNames* const trees[] = {&m_After, &m_Before};
        const std::vector<std::uint32_t> ranks = HierarchyRanks(trees, ids);
        std::vector<std::pair<std::uint32_t, ID>> sorted;
        for (std::size_t i = 0; i < ids.size(); ++i) sorted.emplace_back(ranks[i], ids[i]);
        std::ranges::sort(sorted);
        for (const auto& [rank, id] : sorted) Add(id);
        return std::move(m_Result);
    }

private:
    /// What is moved is the GameObject or instance, what changed is its Transform.
    void FindMove(ID id, const Operation& operation) {
        if (!As<ChangeMappingOperation>(&operation)) return;
        const ObjectBody body = m_After.Places().Body(id);
        if (!body.IsTransform() && !body.IsPrefabInstance()) return;
        const ID place = m_After.Places().PlaceIDOf(body, id);
        if (!place || !IsPlaceIn(m_Before, place) || !IsPlaceIn(m_After, place)) return;
        const ID former = m_Before.Above(place);
        if (former != m_After.Above(place)) m_FormerParents.emplace(place, former);
    }

    static bool IsPlaceIn(const ObjectNames& names, ID id) {
        return Hierarchy::IsPlace(names.Places().Body(id));
    }

    void Add(ID id) {
        const Operation* operation = m_Diff.Find(id);
        ObjectChange change;
        change.id = Printable(id->Value());
        change.kind = KindOf(operation);
        change.name = (change.kind == ChangeKind::Removed ? m_Before : m_After).Name(id);
        if (const auto moved = m_FormerParents.find(id); moved != m_FormerParents.end()) {
            change.isMoved = true;
            if (moved->second) change.formerParent = m_Before.Name(moved->second);
        }
        if (change.kind == ChangeKind::Changed)
            change.properties = Properties(id, *operation);
        else if (m_WithValues && change.kind != ChangeKind::Moved)
            change.properties = m_Properties.Fields(id, change.kind);
        if (change.kind == ChangeKind::Changed && change.properties.empty()) {
            if (!change.isMoved) return;
            change.kind = ChangeKind::Moved;
        }
        Count(change);
        m_Result.objects.push_back(std::move(change));
    }

    static ChangeKind KindOf(const Operation* operation) {
        if (!operation) return ChangeKind::Moved;
        if (As<AddOperation>(operation)) return ChangeKind::Added;
        return As<RemoveOperation>(operation) ? ChangeKind::Removed : ChangeKind::Changed;
    }

    std::vector<PropertyChange> Properties(ID id, const Operation& operation) {
        std::vector<PropertyChange> properties =
            m_Properties.List(id, operation, [&](const YAMLScalar* list, const YAMLNode* item) {
                return IsToldElsewhere(list, item);
            });
        if (m_FormerParents.contains(m_After.Places().PlaceIDOf(m_After.Places().Body(id), id)))
            std::erase_if(properties, [](const PropertyChange& property) {
                return property.place == "m_Father" || property.place == "m_Modification.m_TransformParent";
            });
        return properties;
    }

    /// Whether an element of a list of components or children came or went with its object.
    bool IsToldElsewhere(const YAMLScalar* list, const YAMLNode* item) const {
        if (!IsIn(list, {"m_Component", "m_Children"})) return false;
        ID id = LocalReference(item);
        if (!id) id = ComponentOf(item);
        if (!id) return false;
        const Operation* operation = m_Diff.Find(id);
        if (As<AddOperation>(operation) || As<RemoveOperation>(operation)) return true;
        const Hierarchy& places = m_After.Places();
        return m_FormerParents.contains(places.PlaceIDOf(places.Body(id), id));
    }

    void Count(const ObjectChange& change) {
        m_Result.added += change.kind == ChangeKind::Added;
        m_Result.removed += change.kind == ChangeKind::Removed;
        m_Result.changed += change.kind == ChangeKind::Changed;
        m_Result.moved += change.isMoved;
    }

    const ObjectNames m_Before, m_After;
    const YAMLMappingDiff& m_Diff;
    PropertyChanges m_Properties;
    const bool m_WithValues;
    std::unordered_map<ID, ID> m_FormerParents; // of places that moved; null for the top
    SceneChange m_Result;
};

} // namespace

SceneChange ListChanges(MergeSession& session, std::size_t width, bool withValues) {
    return Lister(session, width, withValues).List();
}

} // namespace ovrin
