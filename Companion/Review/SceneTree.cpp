#include "Review/SceneTree.h"

#include "Names/HierarchyOrder.h"
#include "Review/SideMarks.h"

#include "Diff/YAMLMappingDiff.h"
#include "Session/MergeSession.h"

#include <algorithm>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

using ID = SceneTree::ID;
using Trees = std::array<const ObjectNames*, 4>;

NodeKind KindOf(const ObjectNames& names, ID id) {
    const ObjectBody body = names.Places().Body(id);
    if (Hierarchy::IsPlace(body)) return NodeKind::Place;
    return names.Places().PlaceIDOf(body, id) ? NodeKind::Component : NodeKind::Other;
}

/// Of an object that a side touched: of any other all versions have the same.
Version TellerOf(const MergeSession& session, const MergeNames& names, ID id) {
    const bool isChangedByTheirsAlone = session.LeftDiff().HasKey(id) && !session.RightDiff().HasKey(id);
    const bool hasTheirs = names.Has(Version::Theirs, id);
    if (names.Has(Version::Ours, id) && !(isChangedByTheirsAlone && hasTheirs)) return Version::Ours;
    return hasTheirs ? Version::Theirs : Version::Base;
}

} // namespace

SceneTree::SceneTree(SceneMerge& merge, const MergeNames& names) {
    PlaceNodes(merge, names);
    Number();
    const MergeSession& session = merge.Session();
    for (const YAMLMappingDiff* diff : {&session.LeftDiff(), &session.RightDiff()})
        for (const auto& [id, operation] : diff->Entries())
            if (const auto node = Find(id)) m_Nodes[*node].teller = TellerOf(session, names, id);
    for (const auto& [id, mark] : FindMarks(session, names))
        if (const auto node = Find(id)) m_Nodes[*node].mark = mark;
    for (MarkedNode& node : m_Nodes) {
        node.kind = KindOf(names.In(node.teller), node.id);
        m_Counts.Add(node.mark);
    }
    SumBelow();
}

/// Every object of any tree, once, in order.
void SceneTree::PlaceNodes(SceneMerge& merge, const MergeNames& names) {
    const ObjectNames result(merge.Session().Result().GetMapping());
    const Trees trees = {&result, &names.In(Version::Ours), &names.In(Version::Theirs),
                         &names.In(Version::Base)};
    std::vector<ID> ids;
    m_Indexes.reserve(result.Places().Root().RawEntries().size());
    for (const ObjectNames* tree : trees)
        for (const YAMLMapping::Entry entry : tree->Places().Root().RawEntries())
            if (entry.key && m_Indexes.emplace(entry.key, 0).second) ids.push_back(entry.key);
    const std::vector<HierarchyPlace> places = HierarchyPlaces(trees, ids);
    m_Nodes.resize(ids.size());
    for (std::size_t i = 0; i < ids.size(); ++i) {
        const auto [rank, above] = places[i];
        m_Indexes[ids[i]] = rank;
        m_Nodes[rank].id = ids[i];
        if (above != HierarchyPlace::kNone) m_Nodes[rank].parent = places[above].rank;
    }
}

/// Parents stand ahead of what is below them.
void SceneTree::Number() {
    for (Index i = static_cast<Index>(m_Nodes.size()); i-- > 0;)
        if (m_Nodes[i].parent != MarkedNode::kTop) m_Nodes[m_Nodes[i].parent].size += m_Nodes[i].size;
}

void SceneTree::SumBelow() {
    for (MarkedNode& node : m_Nodes) node.touchedBelow = node.openBelow = 0;
    for (Index i = static_cast<Index>(m_Nodes.size()); i-- > 0;) {
        const MarkedNode& node = m_Nodes[i];
        if (node.parent == MarkedNode::kTop) continue;
        MarkedNode& parent = m_Nodes[node.parent];
        parent.touchedBelow += node.touchedBelow + (node.mark.IsTouched() ? 1 : 0);
        parent.openBelow += node.openBelow + node.open;
    }
}

std::optional<SceneTree::Index> SceneTree::Find(ID id) const {
    const auto found = m_Indexes.find(id);
    return found == m_Indexes.end() ? std::nullopt : std::optional(found->second);
}

std::vector<SceneTree::Index> SceneTree::Children(std::optional<Index> parent, bool touchedOnly) const {
    const Index begin = parent ? *parent + 1 : 0;
    const Index end = parent ? *parent + m_Nodes[*parent].size : static_cast<Index>(m_Nodes.size());
    std::vector<Index> children;
    for (Index i = begin; i < end; i += m_Nodes[i].size)
        if (!touchedOnly || m_Nodes[i].IsOfInterest()) children.push_back(i);
    return children;
}

std::span<const MarkedNode> SceneTree::PartsOf(Index place) const {
    Index end = place + 1;
    while (end < place + m_Nodes[place].size && m_Nodes[end].kind == NodeKind::Component &&
           m_Nodes[end].size == 1)
        ++end;
    return Nodes().subspan(place + 1, end - place - 1);
}

std::vector<SceneTree::Index> SceneTree::Way(Index node) const {
    std::vector<Index> way;
    for (Index above = m_Nodes[node].parent; above != MarkedNode::kTop; above = m_Nodes[above].parent)
        way.push_back(above);
    std::ranges::reverse(way);
    return way;
}

void SceneTree::CountOpen(std::span<const ConflictMark> marks) {
    for (MarkedNode& node : m_Nodes) node.open = 0;
    for (const ConflictMark& mark : marks)
        if (mark.isOpen)
            if (const auto node = Find(mark.about->path.front())) ++m_Nodes[*node].open;
    SumBelow();
}

} // namespace ovrin
