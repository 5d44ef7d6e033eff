#include "Values/YAMLNode.h"

#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"

#include <type_traits>
#include <typeinfo>

namespace ovrin_yaml {

namespace {

/// Calls `function` with the node as what it is.
template <class Node, class Function> auto Dispatch(Node* node, const Function& function) {
    constexpr bool kIsConst = std::is_const_v<Node>;
    switch (node->GetKind()) {
    case YAMLNode::Kind::Mapping:
        return function(*static_cast<std::conditional_t<kIsConst, const YAMLMapping, YAMLMapping>*>(node));
    case YAMLNode::Kind::Sequence:
        return function(*static_cast<std::conditional_t<kIsConst, const YAMLSequence, YAMLSequence>*>(node));
    default:
        return function(*static_cast<std::conditional_t<kIsConst, const YAMLScalar, YAMLScalar>*>(node));
    }
}

} // namespace

void YAMLNode::Free() {
    Dispatch(this, [](auto& node) { node.Free(); });
}

YAMLNode* YAMLNode::Clone() const {
    return Dispatch(this, [](auto& node) { return node.Clone(); });
}

bool YAMLNode::Equals(const YAMLNode* other) const {
    return Dispatch(this, [other](auto& node) { return node.Equals(other); });
}

bool YAMLNode::EqualsExpensive(const YAMLNode* other) const {
    return Dispatch(this, [other](auto& node) { return node.EqualsExpensive(other); });
}

void YAMLNode::Accept(YAMLNodeVisitor& visitor) {
    Dispatch(this, [&visitor](auto& node) { visitor.Visit(node); });
}

void YAMLNode::RebuildHash(bool shallow) {
    Dispatch(this, [shallow](auto& node) { node.RebuildHash(shallow); });
}

YAMLNode* CopyExactly(const YAMLNode* node) {
    if (const YAMLMapping* mapping = AsMapping(node)) return mapping->CopyWith(CopyExactly);
    if (const YAMLSequence* sequence = AsSequence(node)) {
        YAMLSequence* copy = YAMLAlloc<YAMLSequence>::create(sequence->m_Flow);
        copy->m_Items.reserve(sequence->m_Items.size());
        for (const YAMLNode* item : sequence->m_Items)
            copy->m_Items.push_back(item ? CopyExactly(item) : nullptr);
        copy->m_Hash = sequence->m_Hash;
        copy->m_Line = sequence->m_Line;
        return copy;
    }
    return node->Clone();
}

YAMLMapping& ToMapping(YAMLNode* node) {
    if (YAMLMapping* mapping = AsMapping(node)) return *mapping;
    throw std::bad_cast();
}

YAMLSequence& ToSequence(YAMLNode* node) {
    if (YAMLSequence* sequence = AsSequence(node)) return *sequence;
    throw std::bad_cast();
}

} // namespace ovrin_yaml
