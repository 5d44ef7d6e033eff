#pragma once

#include "Review/ReviewSource.h"
#include "Review/SceneAnswers.h"
#include "Review/SceneProcess.h"
#include "Scenes/SceneRules.h"

#include <cstddef>
#include <functional>
#include <list>
#include <memory>
#include <nlohmann/json_fwd.hpp>
#include <vector>

namespace ovrin {

/// The files of a review, each read by a process of its own, of which few stay at hand. Files are told by
/// their indexes among the sources. Only for a process without other threads.
class ReviewScenes {
public:
    /// Is told how many files of how many were read.
    using Progress = std::function<void(std::size_t done, std::size_t all)>;
    /// Takes what was made of one of several files, in no order that means anything.
    template <class Made> using Take = std::function<void(std::size_t file, Made made)>;

    ReviewScenes(const ReviewSources& sources, const SceneRules& rules);

    /// Looks at all files (SceneAnswers::Look). A process that came to an end is told as a problem.
    void Look(const Progress& progress, const Take<nlohmann::json>& take);
    /// SceneAnswers::Answer of a file. Throws Failure if its process came to an end.
    PageAnswer Ask(std::size_t file, PageRequest request, const SceneAnswers::Known& known);

    struct Wanted {
        std::size_t file;
        SceneAnswers::Known known;
    };
    /// SceneAnswers::All of these files; `take` gets the index among `wanted`. Throws Failure for one that
    /// can't be had.
    void All(const std::vector<Wanted>& wanted, const Progress& progress,
             const Take<SceneAnswers::Whole>& take);

private:
    bool AreAllAtHand() const { return m_Sources.files.size() <= kMostHeld; }
    SceneProcess& Hold(std::size_t file);
    PageAnswer AskProcess(std::size_t file, const PageRequest& request);
    std::unique_ptr<SceneAnswers> Open(std::size_t file) const;

    static constexpr std::size_t kMostHeld = 3;

    const ReviewSources& m_Sources;
    const SceneRules& m_Rules;
    struct Held {
        std::size_t file;
        std::unique_ptr<SceneProcess> process;
    };
    std::list<Held> m_Held; // the one that was asked last in front
};

} // namespace ovrin
