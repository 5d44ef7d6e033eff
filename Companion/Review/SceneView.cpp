#include "Review/SceneView.h"

#include <nlohmann/json.hpp>

namespace ovrin {

using nlohmann::json;

SceneView::SceneView(SceneMerge& merge, const MergeNames& names)
    : m_Merge(merge), m_Names(names), m_Tree(merge, names), m_Pages(m_Tree, names) {}

void SceneView::SetConflicts(std::vector<Mark> marks) {
    m_Tree.CountOpen(marks);
    m_Marks.clear();
    for (const Mark& mark : marks)
        if (const auto node = m_Tree.Find(mark.about->path.front())) m_Marks[*node].push_back(mark);
}

std::optional<SceneTree::Index> SceneView::NodeOf(std::string_view id) const {
    return m_Tree.Find(ovrin_yaml::YAMLScalar::Lookup(id));
}

json SceneView::Counts() const {
    const MarkCounts& counts = m_Tree.Counts();
    return {{"added", counts.added},
            {"removed", counts.removed},
            {"changed", counts.changed},
            {"moved", counts.moved}};
}

json SceneView::Tree(std::string_view parent, PageRange range, bool touchedOnly) const {
    if (parent.empty()) return m_Pages.Children(std::nullopt, range, touchedOnly);
    const auto node = NodeOf(parent);
    if (!node) return nullptr;
    return m_Pages.Children(node, range, touchedOnly);
}

json SceneView::Find(std::string_view text, PageRange range) const {
    return m_Pages.Hits(text, range);
}

json SceneView::Object(std::string_view id, bool all) const {
    const auto node = NodeOf(id);
    if (!node) return nullptr;
    const auto marks = m_Marks.find(*node);
    const std::span<const Mark> conflicts = marks == m_Marks.end() ? std::span<const Mark>() : marks->second;
    return ObjectPage(m_Merge, m_Names, m_Tree, m_Pages).Of(*node, conflicts, all);
}

json SceneView::Map(const MapWish& wish) {
    if (!m_Map) m_Map = std::make_unique<SceneMap>(m_Merge.Session(), m_Tree, m_Pages, m_Names);
    return m_Map->Draw(wish);
}

} // namespace ovrin
