#pragma once

#include "Review/SceneTree.h"

#include <nlohmann/json_fwd.hpp>
#include <string>
#include <string_view>
#include <vector>

namespace ovrin {

/// A stretch of a list.
struct PageRange {
    std::size_t from = 0, count = 0;
};

/// A tree piece by piece, as a page asks for it. As long as tree and names live.
class TreePages {
public:
    using Index = SceneTree::Index;

    TreePages(const SceneTree& tree, const MergeNames& names) : m_Tree(tree), m_Names(names) {}

    /// The name of a node without what it stands under.
    std::string LabelOf(Index node) const;

    /// Children of a node, of the top for nothing:
    ///
    ///     {"total", "nodes": [{"id", "name", "kind": "place|component|other", "children", "mark", "by",
    ///                          "open", "below": {"changed", "open"}}]}
    ///
    /// With `touchedOnly` all numbers but the total of conflicts are of what SceneTree::Children gives then.
    nlohmann::json Children(std::optional<Index> parent, PageRange range, bool touchedOnly) const;

    /// Nodes whose name holds a text, whatever the case of its Latin letters, or whose id it is, in the order
    /// of the tree: {"total", "hits": [{"id", "name", "way": [ids], "names": [of the way]}]}. What stands far
    /// down has the upper kMostWay of its way, and "isShortened".
    nlohmann::json Hits(std::string_view text, PageRange range) const;

    /// One node, as Children gives it.
    nlohmann::json NodeOf(Index index, bool touchedOnly) const;

    static constexpr std::size_t kMostWay = 256;

private:
    const SceneTree& m_Tree;
    const MergeNames& m_Names;
    mutable std::vector<std::string> m_Folded; // labels in small letters, from the first search on
};

} // namespace ovrin
