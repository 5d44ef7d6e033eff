#pragma once

#include "Conflicts/Conflict.h"
#include "Review/ReviewSource.h"
#include "Review/SceneView.h"
#include "Scenes/SceneRules.h"

#include <cstddef>
#include <nlohmann/json_fwd.hpp>

namespace ovrin {

/// A scene of a review that was read: the merge of its versions, and the views of it.
class ReviewedScene {
public:
    /// Throws Failure for texts that can't be read.
    ReviewedScene(ThreeTexts texts, const SceneRules& rules, bool isMerge);
    ReviewedScene(const ReviewedScene&) = delete;
    ReviewedScene& operator=(const ReviewedScene&) = delete;

    std::size_t CountOpen() const { return m_Merge.Open().size(); }
    SceneView& View() { return m_View; }
    /// Says which number the first conflict has among those of all scenes; 0 in the beginning.
    void NumberFrom(std::size_t firstItem);
    /// Conflicts from `from` on, `count` at most, as Review/ConflictItem.h has them; in the order of the
    /// hierarchy. `scene` is the scene's number.
    nlohmann::json Items(std::size_t scene, PageRange range) const;
    /// The whole scene for a page that is a file of its own, as JSON text:
    ///
    ///     {"tree": [nodes as in Review/TreePages.h with "parent", those that were touched or are open and
    ///     what
    ///               they stand under],
    ///      "objects": {id: as in Review/ObjectPage.h, of those that were touched or are open},
    ///      "map": {"top", "side"}, as in Review/SceneMap.h}
    struct WholeText {
        std::string text;
        std::size_t leftOut = 0; ///< objects, where those ahead of them fill kMostWhole bytes
    };
    WholeText Whole();

    static constexpr std::size_t kMostWhole = std::size_t{64} << 20;

private:
    nlohmann::json TouchedNodes() const;

    SceneMerge m_Merge;
    ConflictWords m_Words;
    SceneView m_View;
    std::vector<ConflictMark> m_Marks; // in the order of the items
};

} // namespace ovrin
