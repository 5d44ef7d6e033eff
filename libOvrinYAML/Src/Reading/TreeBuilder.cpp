#include "Reading/TreeBuilder.h"

#include "Values/Hash.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"

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
    const std::span<YAMLNode* const> nodes(m_Nodes.data() + open.firstNode, m_Nodes.size() - open.firstNode);
    if (nodes.size() / 2 > YAMLMapping::kMostPairs) throw YAMLError("Mapping is too long");
    // An object gets its header data behind the keys of its body.
    YAMLMapping* mapping = m_Open.empty() ? nullptr : MakeUsualMapping(open, nodes);
    if (!mapping) {
        mapping = YAMLAlloc<YAMLMapping>::create(open.flow);
        mapping->Reserve(nodes.size() / 2 + (m_Open.empty() ? 3 : 0));
        mapping->AppendPairs(nodes.data(), nodes.size());
    }
    std::uint32_t hash = 0;
    std::uint32_t index = 0;
    for (std::size_t i = 0; i + 1 < nodes.size(); i += 2, ++index)
        if (AsScalar(nodes[i])) hash = FoldPair(hash, nodes[i]->m_Hash, nodes[i + 1]->m_Hash, index);
    mapping->m_Hash = hash;
    return mapping;
}

/// Null if a key is no scalar or stands there twice.
YAMLMapping* TreeBuilder::MakeUsualMapping(const OpenContainer& open, std::span<YAMLNode* const> nodes) {
    const std::size_t count = nodes.size() / 2;
    for (std::size_t i = 0; i < count; ++i)
        if (!AsScalar(nodes[2 * i])) return nullptr;
    const KeyLists::List keys =
        m_KeyLists.Get(count, [nodes](std::size_t i) { return AsScalar(nodes[2 * i]); });
    if (!keys) return nullptr;
    YAMLMapping* mapping = YAMLMapping::Create(open.flow, keys, count);
    for (std::size_t i = 0; i < count; ++i) mapping->Values()[i] = nodes[2 * i + 1];
    return mapping;
}

YAMLNode* TreeBuilder::MakeSequence(const OpenContainer& open) const {
    if (m_Nodes.size() - open.firstNode > YAMLSequence::kMostItems) throw YAMLError("Sequence is too long");
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
