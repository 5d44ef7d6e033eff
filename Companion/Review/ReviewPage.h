#pragma once

#include "Review/PageRequest.h"
#include "Review/ReviewScenes.h"
#include "Review/ReviewSource.h"
#include "Scenes/SceneRules.h"

#include <cstddef>
#include <nlohmann/json_fwd.hpp>
#include <string>
#include <vector>

namespace ovrin {

/// The scenes of a review, as a page shows them: one list over all of them, in which nothing can be decided.
/// All are looked at when it begins. Only for a process without other threads.
class ReviewPage {
public:
    using Progress = ReviewScenes::Progress;

    ReviewPage(ReviewSources sources, SceneRules rules, const Progress& progress);
    ReviewPage(const ReviewPage&) = delete;
    ReviewPage& operator=(const ReviewPage&) = delete;

    /// Files that are scenes, those that can't be read among them.
    std::size_t CountScenes() const { return m_Scenes.size(); }
    /// Other files that differ.
    std::size_t CountOthers() const { return m_Sources.files.size() - m_Scenes.size(); }
    /// Why scenes can't be read, a line each.
    std::vector<std::string> Problems() const;

    /// The answer to a request for data; one of status 404 for what it doesn't know.
    PageAnswer Answer(const PageRequest& request);

    /// All that a page could ask for, of what was touched, as JSON text:
    ///
    ///     {"session", "conflicts": [all items], "scenes": [as ReviewedScene::WholeText]}
    ///
    /// `leftOut` becomes the number of objects for whose values there was no room. Throws Failure for a scene
    /// that was changed since the review began.
    std::string Whole(const Progress& progress, std::size_t& leftOut);

private:
    struct Scene {
        std::size_t file = 0; ///< among the sources
        SceneAnswers::Known known;
        std::string counts; ///< JSON
        std::string problem;
    };
    void TakeLook(std::size_t file, const nlohmann::json& look);
    nlohmann::json Session() const;
    nlohmann::json SceneJson(const Scene& scene) const;
    PageAnswer AnswerItems(const PageRequest& request);
    PageAnswer AnswerOfScene(const PageRequest& request);
    PageAnswer Ask(const Scene& scene, const PageRequest& request);

    const ReviewSources m_Sources;
    const SceneRules m_Rules;
    ReviewScenes m_Processes;
    std::vector<Scene> m_Scenes; // in the order of the sources
    std::size_t m_Open = 0;
};

} // namespace ovrin
