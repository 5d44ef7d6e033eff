#include "Changes/SceneChange.h"

#include "Changes/ChangedObjects.h"
#include "Names/HierarchyOrder.h"
#include "Names/PrintableText.h"

#include "Session/MergeSession.h"

#include <algorithm>
#include <utility>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

using ID = ObjectNames::ID;

class Lister {
public:
    Lister(MergeSession& session, std::size_t width, bool withValues)
        : m_Before(session.BaseObjects().GetMapping()), m_After(session.LeftObjects().GetMapping()),
          m_Changed(m_Before, m_After, session.LeftDiff(), session.Rules(), width), m_WithValues(withValues) {
    }

    SceneChange List() {
        const std::vector<ID> ids = m_Changed.Candidates();
        const ObjectNames* const trees[] = {&m_After, &m_Before};
        const std::vector<std::uint32_t> ranks = HierarchyRanks(trees, ids);
        std::vector<std::pair<std::uint32_t, ID>> sorted;
        for (std::size_t i = 0; i < ids.size(); ++i) sorted.emplace_back(ranks[i], ids[i]);
        std::ranges::sort(sorted);
        for (const auto& [rank, id] : sorted) Add(id);
        return std::move(m_Result);
    }

private:
    void Add(ID id) {
        const std::optional<ChangedObjects::Change> found = m_Changed.Find(id);
        if (!found) return;
        ObjectChange change;
        change.id = Printable(id->Value());
        change.kind = found->kind;
        change.name = (change.kind == ChangeKind::Removed ? m_Before : m_After).Name(id);
        change.isMoved = found->isMoved;
        if (found->formerParent) change.formerParent = m_Before.Name(found->formerParent);
        if (change.kind == ChangeKind::Changed)
            change.properties = m_Changed.Properties(id);
        else if (m_WithValues && change.kind != ChangeKind::Moved)
            change.properties = m_Changed.Fields(id, change.kind);
        Count(change);
        m_Result.objects.push_back(std::move(change));
    }

    void Count(const ObjectChange& change) {
        m_Result.added += change.kind == ChangeKind::Added;
        m_Result.removed += change.kind == ChangeKind::Removed;
        m_Result.changed += change.kind == ChangeKind::Changed;
        m_Result.moved += change.isMoved;
    }

    const ObjectNames m_Before, m_After;
    ChangedObjects m_Changed;
    const bool m_WithValues;
    SceneChange m_Result;
};

} // namespace

SceneChange ListChanges(MergeSession& session, std::size_t width, bool withValues) {
    return Lister(session, width, withValues).List();
}

} // namespace ovrin
