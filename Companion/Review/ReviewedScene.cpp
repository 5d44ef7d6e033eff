#include "Review/ReviewedScene.h"

#include "Names/PrintableText.h"
#include "Review/ConflictItem.h"

#include <algorithm>
#include <limits>
#include <nlohmann/json.hpp>

namespace ovrin {

using nlohmann::json;

namespace {

/// The merge, which is what everything else is made from.
SceneMerge& Merged(SceneMerge& merge) {
    merge.Merge();
    return merge;
}

std::vector<const OpenConflict*> InOrder(const SceneMerge& merge, const SceneTree& tree) {
    std::vector<const OpenConflict*> open;
    for (const OpenConflict& conflict : merge.Open()) open.push_back(&conflict);
    std::ranges::stable_sort(open, {}, [&](const OpenConflict* conflict) {
        return tree.Find(conflict->path.front()).value_or(std::numeric_limits<SceneTree::Index>::max());
    });
    return open;
}

} // namespace

ReviewedScene::ReviewedScene(ThreeTexts texts, const SceneRules& rules, bool isMerge, std::size_t firstItem)
    : m_Merge(std::move(texts), rules.rules, rules.types),
      m_Words(Merged(m_Merge), 0,
              isMerge ? MergeNames::Words{"base", "ours", "theirs"}
                      : MergeNames::Words{"before", "before", "after"}),
      m_View(m_Merge, m_Words.Names()) {
    for (const OpenConflict* conflict : InOrder(m_Merge, m_View.Nodes()))
        m_Marks.push_back({conflict, firstItem + m_Marks.size()});
    m_View.SetConflicts(m_Marks);
}

json ReviewedScene::Items(std::size_t scene, PageRange range) const {
    json items = json::array();
    for (std::size_t i = range.from; i < m_Marks.size() && i - range.from < range.count; ++i)
        items.push_back(ConflictItem(m_Words.Describe(*m_Marks[i].about), {m_Marks[i].item, scene}));
    return items;
}

json ReviewedScene::Whole() {
    const SceneTree& tree = m_View.Nodes();
    json nodes = json::array(), objects = json::object();
    bool isShortened = false;
    for (SceneTree::Index i = 0; i < tree.Nodes().size(); ++i) {
        const MarkedNode& node = tree.Nodes()[i];
        if (!node.IsOfInterest()) continue;
        json written = m_View.Pages().NodeOf(i, true);
        const std::string id = written["id"];
        const bool isTop = node.parent == MarkedNode::kTop;
        written["parent"] = isTop ? json() : json(Printable(tree.Nodes()[node.parent].id->Value()));
        nodes.push_back(std::move(written));
        if (objects.size() < kMostWholeObjects)
            objects[id] = m_View.Object(node.id->Value(), false);
        else
            isShortened = true;
    }
    json whole = {
        {"tree", std::move(nodes)},
        {"objects", std::move(objects)},
        {"map",
         {{"top", m_View.Map({.view = MapView::Top})}, {"side", m_View.Map({.view = MapView::Side})}}}};
    if (isShortened) whole["isShortened"] = true;
    return whole;
}

} // namespace ovrin
