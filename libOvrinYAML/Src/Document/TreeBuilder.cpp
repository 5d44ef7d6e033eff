#include "Document/TreeBuilder.h"

#include "Document/Hash.h"
#include "Document/YAMLMapping.h"
#include "Document/YAMLScalar.h"
#include "Document/YAMLSequence.h"

namespace ovrin_yaml {

void TreeBuilder::Open(YAMLNode::Kind kind, bool flow, std::uint32_t line) {
    m_Open.push_back({kind, flow, line, m_Nodes.size()});
}

YAMLNode* TreeBuilder::Close() {
    const OpenContainer open = m_Open.back();
    m_Open.pop_back();
    YAMLNode* node = open.kind == YAMLNode::Kind::Mapping ? MakeMapping(open) : MakeSequence(open);
    node->m_Line = open.line;
    m_Nodes.resize(open.firstNode);
    m_Nodes.push_back(node);
    return node;
}

YAMLNode* TreeBuilder::MakeMapping(const OpenContainer& open) {
    YAMLMapping* mapping = YAMLAlloc<YAMLMapping>::create(open.flow);
    // An object gets its header data behind the keys of its body.
    const std::size_t headerEntries = m_Open.empty() ? 3 : 0;
    mapping->Reserve((m_Nodes.size() - open.firstNode) / 2 + headerEntries);
    std::uint32_t hash = 0;
    std::uint32_t index = 0;
    for (std::size_t i = open.firstNode; i + 1 < m_Nodes.size(); i += 2, ++index)
        if (AsScalar(m_Nodes[i])) hash = FoldPair(hash, m_Nodes[i]->m_Hash, m_Nodes[i + 1]->m_Hash, index);
    mapping->AppendPairs(m_Nodes.data() + open.firstNode, m_Nodes.size() - open.firstNode);
    mapping->m_Hash = hash;
    return mapping;
}

YAMLNode* TreeBuilder::MakeSequence(const OpenContainer& open) const {
    YAMLSequence* sequence = YAMLAlloc<YAMLSequence>::create(open.flow);
    sequence->m_Items.assign(m_Nodes.begin() + static_cast<std::ptrdiff_t>(open.firstNode), m_Nodes.end());
    std::uint32_t hash = 0;
    std::uint32_t index = 0;
    for (const YAMLNode* item : sequence->m_Items) hash = FoldItem(hash, item->m_Hash, index++);
    sequence->m_Hash = hash;
    return sequence;
}

YAMLNode* TreeBuilder::TakeRoot() {
    YAMLNode* root = m_Nodes.empty() ? nullptr : m_Nodes.front();
    m_Nodes.clear();
    return root;
}

} // namespace ovrin_yaml
