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

/// Every object of any tree, once.
std::vector<ID> AllObjects(const Trees& trees) {
    std::vector<ID> ids;
    std::unordered_map<ID, bool> met;
    met.reserve(trees.front()->Places().Root().RawEntries().size());
    for (const ObjectNames* tree : trees)
        for (const YAMLMapping::Entry entry : tree->Places().Root().RawEntries())
            if (entry.key && met.emplace(entry.key, true).second) ids.push_back(entry.key);
    return ids;
}

NodeKind KindOf(const ObjectNames& names, ID id) {
    const ObjectBody body = names.Places().Body(id);
    if (Hierarchy::IsPlace(body)) return NodeKind::Place;
    return names.Places().PlaceIDOf(body, id) ? NodeKind::Component : NodeKind::Other;
}

Version TellerOf(const MergeSession& session, const MergeNames& names, ID id) {
    const bool isChangedByTheirsAlone = session.LeftDiff().HasKey(id) && !session.RightDiff().HasKey(id);
    const bool hasTheirs = names.Has(Version::Theirs, id);
    if (names.Has(Version::Ours, id) && !(isChangedByTheirsAlone && hasTheirs)) return Version::Ours;
    return hasTheirs ? Version::Theirs : Version::Base;
}

} // namespace

SceneTree::SceneTree(SceneMerge& merge, const MergeNames& names) : m_Nodes(NodesInOrder(merge, names)) {
    m_Indexes.reserve(m_Nodes.size());
    for (Index i = 0; i < m_Nodes.size(); ++i) m_Indexes.emplace(m_Nodes[i].id, i);
    Number();
    const MergeSession& session = merge.Session();
    const auto marks = FindMarks(session, names);
    for (MarkedNode& node : m_Nodes) {
        node.teller = TellerOf(session, names, node.id);
        node.kind = KindOf(names.In(node.teller), node.id);
        if (const auto mark = marks.find(node.id); mark != marks.end()) node.mark = mark->second;
        m_Counts.Add(node.mark);
    }
    SumBelow();
}

/// Nodes that know what they stand under by its id's place among them.
std::vector<MarkedNode> SceneTree::NodesInOrder(SceneMerge& merge, const MergeNames& names) const {
    const ObjectNames result(merge.Session().Result().GetMapping());
    const Trees trees = {&result, &names.In(Version::Ours), &names.In(Version::Theirs),
                         &names.In(Version::Base)};
    const std::vector<ID> ids = AllObjects(trees);
    const std::vector<std::uint32_t> ranks = HierarchyRanks(trees, ids);
    std::unordered_map<ID, Index> rankOf;
    rankOf.reserve(ids.size());
    for (std::size_t i = 0; i < ids.size(); ++i) rankOf.emplace(ids[i], ranks[i]);
    std::vector<MarkedNode> nodes(ids.size());
    for (std::size_t i = 0; i < ids.size(); ++i) {
        MarkedNode& node = nodes[ranks[i]];
        node.id = ids[i];
        const auto tree = std::ranges::find_if(trees, [&](const ObjectNames* t) { return t->Has(node.id); });
        if (const ID above = (*tree)->Above(node.id)) node.parent = rankOf.at(above);
    }
    return nodes;
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
