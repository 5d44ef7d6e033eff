#pragma once

#include "Review/ConflictMark.h"
#include "Review/TreePages.h"

#include <nlohmann/json_fwd.hpp>
#include <span>

namespace ovrin {

/// Everything about one object for a page:
///
///     {"id", "heading", "names": {"base", "ours", "theirs"}, "mark", "by", "way": [{"id", "name"}],
///      "parts": [{"id", "name", "mark", "open"}], "isShortened": true where something was left out,
///      "rows": [{"property", "place", "item", "type", "state", "values": {"base", "ours", "theirs",
///                "result"}}]}
///
/// A value is null or {"text", "numbers", "target", "isShortened"} (Review/ObjectRows.h). Rows, parts and
/// texts are bounded: 2,000, 2,000 and 64 KB.
class ObjectPage {
public:
    /// All must outlive the page.
    ObjectPage(SceneMerge& merge, const MergeNames& names, const SceneTree& tree, const TreePages& pages)
        : m_Merge(merge), m_Names(names), m_Tree(tree), m_Pages(pages) {}

    /// The object of a node, with the conflicts about it and the merge's present result. With `all` the rows
    /// that nobody changed, too.
    nlohmann::json Of(SceneTree::Index node, std::span<const ConflictMark> conflicts, bool all) const;

private:
    nlohmann::json Head(SceneTree::Index index) const;
    nlohmann::json Way(SceneTree::Index node, bool& isShortened) const;
    nlohmann::json Parts(SceneTree::Index node, bool& isShortened) const;

    SceneMerge& m_Merge;
    const MergeNames& m_Names;
    const SceneTree& m_Tree;
    const TreePages& m_Pages;
};

} // namespace ovrin
