#pragma once

#include "Review/PageRequest.h"
#include "Review/ReviewSource.h"
#include "Scenes/SceneRules.h"

#include <cstddef>
#include <memory>
#include <nlohmann/json_fwd.hpp>
#include <string>

namespace ovrin {

class ReviewedScene;

/// A file of a review, as far as it is a scene: what its process knows, and answers.
class SceneAnswers {
public:
    /// Reads the file. What is wrong with it is told by Look, and by whatever else is asked.
    SceneAnswers(const ReviewSource& source, const SceneRules& rules, bool isMerge);
    SceneAnswers(const SceneAnswers&) = delete;
    SceneAnswers& operator=(const SceneAnswers&) = delete;
    ~SceneAnswers();

    /// null for what is no scene, {"counts", "open"}, or {"problem"}.
    nlohmann::json Look() const;

    /// What a look has said of the scene, and where it stands in the review.
    struct Known {
        std::size_t scene = 0, firstItem = 0, open = 0;
    };
    /// Answers what is about one scene, and "api/conflicts" with the array of its items, `from` and `count`
    /// counted in the scene. A file that was changed since the look is told with status 409.
    PageAnswer Answer(const PageRequest& request, const Known& known);

    /// The scene for a page that is a file of its own.
    struct Whole {
        std::string items, views; ///< JSON: an array, and as ReviewedScene::WholeText
        std::size_t leftOut = 0;
    };
    /// Throws Failure for a file that was changed since the look.
    Whole All(const Known& known);

private:
    void Check(const Known& known) const;

    std::unique_ptr<ReviewedScene> m_Scene; // null for what is none, or can't be read
    std::string m_Problem;
};

} // namespace ovrin
