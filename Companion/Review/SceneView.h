#pragma once

#include "Review/ConflictMark.h"
#include "Review/ObjectPage.h"
#include "Review/SceneMap.h"
#include "Review/SceneTree.h"
#include "Review/TreePages.h"

#include <map>
#include <memory>
#include <nlohmann/json_fwd.hpp>
#include <optional>
#include <string_view>
#include <vector>

namespace ovrin {

/// One merge for a page: its tree, its objects and its map, piece by piece.
///
///     SceneView view(merge, names);
///     view.SetConflicts(marks);
///     view.Tree(std::nullopt, {0, 200}, false);
///
/// The tree is built with it, the map when it is asked for first. For one thread at a time, as long as merge
/// and names live. What is asked of an id that no version has is null.
class SceneView {
public:
    using Mark = ConflictMark;

    /// The merge must have been merged, with its open conflicts at ours, and `names` be those of its trees.
    SceneView(SceneMerge& merge, const MergeNames& names);
    SceneView(const SceneView&) = delete;
    SceneView& operator=(const SceneView&) = delete;

    /// The conflicts of the scene, in place of those that were.
    void SetConflicts(std::vector<Mark> marks);

    /// {"added", "removed", "changed", "moved"}: objects.
    nlohmann::json Counts() const;
    /// As in Review/TreePages.h; the top for an empty id.
    nlohmann::json Tree(std::string_view parent, PageRange range, bool touchedOnly) const;
    nlohmann::json Find(std::string_view text, PageRange range) const;
    /// As in Review/ObjectPage.h. "result" is what the merge has at the time.
    nlohmann::json Object(std::string_view id, bool all) const;
    /// As in Review/SceneMap.h.
    nlohmann::json Map(const MapWish& wish);

    const SceneTree& Nodes() const { return m_Tree; }
    const TreePages& Pages() const { return m_Pages; }

private:
    std::optional<SceneTree::Index> NodeOf(std::string_view id) const;

    SceneMerge& m_Merge;
    const MergeNames& m_Names;
    SceneTree m_Tree;
    const TreePages m_Pages;
    std::map<SceneTree::Index, std::vector<Mark>> m_Marks; // by the objects that they are about
    std::unique_ptr<SceneMap> m_Map;
};

} // namespace ovrin
