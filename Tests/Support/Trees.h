#pragma once

#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"

#include <initializer_list>
#include <string_view>
#include <utility>

/// Value trees as expressions: Block({{"m_Father", Flow({{"fileID", "0"}})}, {"m_Name", ""}}).
/// Nobody owns them; their memory stays until the process ends.
namespace trees {

using namespace ovrin_yaml;

struct Tree {
    Tree(const char* text) : node(YAMLScalar::Lookup(text)) {}
    Tree(std::string_view text) : node(YAMLScalar::Lookup(text)) {}
    Tree(YAMLNode* node) : node(node) {}
    operator YAMLNode*() const { return node; }
    YAMLNode* operator->() const { return node; }

    YAMLNode* node;
};

using TreePairs = std::initializer_list<std::pair<std::string_view, Tree>>;
using TreeItems = std::initializer_list<Tree>;

inline YAMLMapping* Mapping(TreePairs pairs, bool flow) {
    YAMLMapping* mapping = YAMLAlloc<YAMLMapping>::create(flow);
    for (const auto& [key, value] : pairs) mapping->Append(YAMLScalar::Lookup(key), value);
    return mapping;
}

inline YAMLSequence* Sequence(TreeItems items, bool flow) {
    YAMLSequence* sequence = YAMLAlloc<YAMLSequence>::create(flow);
    sequence->m_Items.assign(items.begin(), items.end());
    return sequence;
}

inline YAMLMapping* Block(TreePairs pairs) {
    return Mapping(pairs, false);
}
inline YAMLMapping* Flow(TreePairs pairs) {
    return Mapping(pairs, true);
}
inline YAMLSequence* BlockList(TreeItems items) {
    return Sequence(items, false);
}
inline YAMLSequence* FlowList(TreeItems items) {
    return Sequence(items, true);
}

} // namespace trees
