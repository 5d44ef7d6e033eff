#include "Merge/PropertyPath.h"

#include "Values/Arena.h"

#include <algorithm>
#include <new>

namespace ovrin_yaml {

std::string PathToString(std::span<const YAMLScalar* const> path) {
    std::string text;
    for (std::size_t i = 0; i < path.size(); ++i) {
        if (i > 0) text += '.';
        text += path[i]->Value();
    }
    return text;
}

std::string PathToString(const KeptPath& path) {
    return PathToString(path.Elements());
}

Path KeptPath::Elements() const {
    Path elements;
    for (const PathNode* node = m_Last; node; node = node->parent) elements.push_back(node->element);
    std::reverse(elements.begin(), elements.end());
    return elements;
}

void WalkedPath::Pop() {
    m_Elements.pop_back();
    if (m_Nodes.size() > m_Elements.size()) m_Nodes.pop_back();
}

KeptPath WalkedPath::Keep() {
    while (m_Nodes.size() < m_Elements.size()) {
        const PathNode* parent = m_Nodes.empty() ? nullptr : m_Nodes.back();
        void* memory = ArenaAllocate(sizeof(PathNode));
        m_Nodes.push_back(new (memory) PathNode{parent, m_Elements[m_Nodes.size()]});
    }
    return KeptPath(m_Nodes.empty() ? nullptr : m_Nodes.back());
}

} // namespace ovrin_yaml
