#pragma once

#include "Reading/Fast/KeyLists.h"
#include "Values/YAMLNode.h"

#include <cstdint>
#include <span>
#include <vector>

namespace ovrin_yaml {

/// Builds a value tree from the inside out, with hashes and lines, as libyaml meets its parts. Takes any
/// tree, with repeated keys and keys that are no scalars.
///
/// Nodes that wait for their container stand on one stack; closing a container takes its part of the stack,
/// so that each container is made once, with its final size.
///
///     a: [1, 2]    open mapping | "a" | open sequence | "1" "2" | close: [1, 2] | close: {a: [1, 2]}
class TreeBuilder {
public:
    void AddNode(YAMLNode* node) { m_Nodes.push_back(node); }
    /// Opens a container; `line` is where it starts.
    void Open(YAMLNode::Kind kind, bool flow, std::uint32_t line);
    /// Makes the container opened last, adds it to the one around it and returns it. A pair whose key is no
    /// scalar is dropped and folds nothing into the hash, but its index counts. Throws YAMLError "Mapping is
    /// too long" or "Sequence is too long" for more than such a container can hold.
    YAMLNode* Close();

    /// Containers that are open.
    std::size_t Depth() const { return m_Open.size(); }
    /// The finished tree, or null. Empties the builder.
    YAMLNode* TakeRoot();

private:
    struct OpenContainer {
        YAMLNode::Kind kind;
        bool flow;
        std::uint32_t line;
        std::size_t firstNode;
    };

    YAMLNode* MakeMapping(const OpenContainer& open);
    YAMLMapping* MakeUsualMapping(const OpenContainer& open, std::span<YAMLNode* const> nodes);
    YAMLNode* MakeSequence(const OpenContainer& open) const;

    std::vector<YAMLNode*> m_Nodes;
    std::vector<OpenContainer> m_Open;
    KeyLists m_KeyLists;
};

} // namespace ovrin_yaml
