#pragma once

#include "Review/PageRequest.h"
#include "Review/ReviewSource.h"
#include "Review/SceneProcess.h"
#include "Review/TreePages.h"
#include "Scenes/SceneRules.h"

#include <cstddef>
#include <functional>
#include <list>
#include <memory>
#include <nlohmann/json_fwd.hpp>
#include <string>
#include <vector>

namespace ovrin {

class ReviewedScene;

/// The scenes of a review, as a page shows them: one list over all of them, in which nothing can be decided.
///
/// Each scene is read in a process of its own when the review begins, for its numbers, and in another one
/// when a page asks for it; few of those are kept. Only for a process without other threads.
class ReviewPage {
public:
    /// Is told how many scenes of how many were read.
    using Progress = std::function<void(std::size_t done, std::size_t all)>;

    ReviewPage(ReviewSources sources, SceneRules rules, const Progress& progress);

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
    ///     {"session", "conflicts": [all items], "scenes": [as ReviewedScene::Whole]}
    std::string Whole(const Progress& progress) const;

private:
    struct Scene {
        std::size_t source = 0;
        std::size_t open = 0, firstItem = 0;
        std::string counts; // JSON
        std::string problem;
    };
    void Look(const Progress& progress);
    std::string LookAt(std::size_t source) const;
    std::string WholeOf(std::size_t scene) const;
    nlohmann::json Session() const;
    nlohmann::json SceneJson(const Scene& scene) const;
    PageAnswer AnswerItems(const PageRequest& request);
    PageAnswer AnswerOfScene(const PageRequest& request);
    std::unique_ptr<ReviewedScene> Open(const Scene& scene) const;
    PageAnswer Ask(std::size_t scene, const PageRequest& request);

    ReviewSources m_Sources;
    SceneRules m_Rules;
    std::vector<Scene> m_Scenes; // in the order of the sources
    std::size_t m_Open = 0;
    struct Held {
        std::size_t scene;
        std::unique_ptr<SceneProcess> process;
    };
    std::list<Held> m_Held; // the one that was asked last in front
};

} // namespace ovrin
