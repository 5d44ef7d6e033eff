#pragma once

#include "Merge/PropertyPath.h"

#include <cstddef>
#include <cstdint>
#include <unordered_map>
#include <utility>
#include <vector>

namespace ovrin_yaml {

/// Numbers paths in their order, element by element as byte strings: "10" goes before "9", and a path before
/// the longer ones that begin with it. Equal paths have one number.
///
/// The paths that are added form a tree, in which each stands once; its nodes are numbered from the root on,
/// children by their text. So the cost goes by the nodes of the paths and not by their lengths.
class PathRanks {
public:
    /// Returns the path's index, the same for equal paths.
    std::uint32_t Add(const KeptPath& path);
    /// The numbers of all paths that were added, by index.
    std::vector<std::uint32_t> Ranks() const;

private:
    struct TreeNode {
        std::uint32_t parent;
        const YAMLScalar* element;
    };
    using Step = std::pair<std::uint32_t, const YAMLScalar*>; // from a tree node to one of its children
    struct StepHash {
        std::size_t operator()(const Step& step) const;
    };

    std::vector<std::uint32_t> SiblingsByText() const;

    std::vector<TreeNode> m_Tree = {{0, nullptr}}; // parents go before their children; first the empty path
    std::unordered_map<Step, std::uint32_t, StepHash> m_Children;
    std::unordered_map<const PathNode*, std::uint32_t> m_Indexes;
};

} // namespace ovrin_yaml
