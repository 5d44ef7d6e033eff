#include "Merge/PathRanks.h"

#include <algorithm>
#include <functional>
#include <numeric>

namespace ovrin_yaml {

std::size_t PathRanks::StepHash::operator()(const Step& step) const {
    return std::hash<const YAMLScalar*>()(step.second) * 31 + step.first;
}

std::uint32_t PathRanks::Add(const KeptPath& path) {
    std::vector<const PathNode*> added;
    std::uint32_t index = 0;
    for (const PathNode* node = path.Last(); node; node = node->parent) {
        const auto known = m_Indexes.find(node);
        if (known != m_Indexes.end()) {
            index = known->second;
            break;
        }
        added.push_back(node);
    }
    for (; !added.empty(); added.pop_back()) {
        const PathNode* node = added.back();
        const auto next = static_cast<std::uint32_t>(m_Tree.size());
        const auto [child, isNew] = m_Children.try_emplace({index, node->element}, next);
        if (isNew) m_Tree.push_back({index, node->element});
        index = child->second;
        m_Indexes.emplace(node, index);
    }
    return index;
}

std::vector<std::uint32_t> PathRanks::SiblingsByText() const {
    std::vector<std::uint32_t> order(m_Tree.size() - 1);
    std::iota(order.begin(), order.end(), 1);
    std::sort(order.begin(), order.end(), [this](std::uint32_t a, std::uint32_t b) {
        const TreeNode &x = m_Tree[a], &y = m_Tree[b];
        return x.parent != y.parent ? x.parent < y.parent : x.element->Value() < y.element->Value();
    });
    return order;
}

std::vector<std::uint32_t> PathRanks::Ranks() const {
    std::vector<std::uint32_t> sizes(m_Tree.size(), 1); // of the subtrees
    for (std::size_t i = m_Tree.size() - 1; i > 0; --i) sizes[m_Tree[i].parent] += sizes[i];
    std::vector<std::uint32_t> next(m_Tree.size(), 1); // the rank of a node's next child
    std::vector<std::uint32_t> ranks(m_Tree.size(), 0);
    for (const std::uint32_t node : SiblingsByText()) {
        std::uint32_t& rank = next[m_Tree[node].parent];
        ranks[node] = rank;
        next[node] = rank + 1;
        rank += sizes[node];
    }
    return ranks;
}

} // namespace ovrin_yaml
