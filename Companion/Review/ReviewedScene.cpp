#include "Review/ReviewedScene.h"

#include "Names/PrintableText.h"
#include "Review/ConflictItem.h"
#include "Review/PageRequest.h"

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

ReviewedScene::ReviewedScene(ThreeTexts texts, const SceneRules& rules, bool isMerge)
    : m_Merge(std::move(texts), rules.rules, rules.types),
      m_Words(Merged(m_Merge), 0,
              isMerge ? MergeNames::Words{"base", "ours", "theirs"}
                      : MergeNames::Words{"before", "before", "after"}),
      m_View(m_Merge, m_Words.Names()) {
    for (const OpenConflict* conflict : InOrder(m_Merge, m_View.Nodes()))
        m_Marks.push_back({conflict, m_Marks.size()});
    m_View.SetConflicts(m_Marks);
}

void ReviewedScene::NumberFrom(std::size_t firstItem) {
    if (m_Marks.empty() || m_Marks.front().item == firstItem) return;
    for (ConflictMark& mark : m_Marks) mark.item = firstItem++;
    m_View.SetConflicts(m_Marks);
}

json ReviewedScene::Items(std::size_t scene, PageRange range) const {
    json items = json::array();
    for (std::size_t i = range.from; i < m_Marks.size() && i - range.from < range.count; ++i)
        items.push_back(ConflictItem(m_Words.Describe(*m_Marks[i].about), {m_Marks[i].item, scene}));
    return items;
}

json ReviewedScene::TouchedNodes() const {
    const SceneTree& tree = m_View.Nodes();
    json nodes = json::array();
    for (SceneTree::Index i = 0; i < tree.Nodes().size(); ++i) {
        const MarkedNode& node = tree.Nodes()[i];
        if (!node.IsOfInterest()) continue;
        json written = m_View.Pages().NodeOf(i, true);
        const bool isTop = node.parent == MarkedNode::kTop;
        written["parent"] = isTop ? json() : json(Printable(tree.Nodes()[node.parent].id->Value()));
        nodes.push_back(std::move(written));
    }
    return nodes;
}

ReviewedScene::WholeText ReviewedScene::Whole() {
    WholeText whole;
    std::string objects;
    for (const MarkedNode& node : m_View.Nodes().Nodes()) {
        if (!node.mark.IsTouched() && !node.open) continue;
        if (objects.size() > kMostWhole) {
            ++whole.leftOut;
            continue;
        }
        if (!objects.empty()) objects += ',';
        objects +=
            JsonText(Printable(node.id->Value())) + ":" + JsonText(m_View.Object(node.id->Value(), false));
    }
    const json map = {{"top", m_View.Map({MapView::Top, {}})}, {"side", m_View.Map({MapView::Side, {}})}};
    whole.text = R"({"tree":)" + JsonText(TouchedNodes()) + R"(,"objects":{)" + objects + R"(},"map":)" +
                 JsonText(map) + "}";
    return whole;
}

} // namespace ovrin
