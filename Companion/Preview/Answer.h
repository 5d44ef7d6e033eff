#pragma once

#include "Preview/Sharing.h"
#include "Systems/GitHistory.h"

#include <cstddef>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

namespace ovrin {

/// What a merge would make of a scene.
enum class Verdict {
    Clean,     ///< merged
    Conflicts, ///< a person is needed
    Unknown,   ///< it couldn't be merged to see
};

/// What the two sides did to a scene.
enum class Meeting {
    BothChanged,
    BothAdded,
    OursRemoved,   ///< what theirs changed
    TheirsRemoved, ///< what ours changed
    Misplaced,     ///< it was renamed on both sides, or something else has its name
};

/// A scene that both sides touched, and what would become of it.
struct PreviewedScene {
    std::size_t number = 0; ///< among those of the whole question, from 1, in the order of their paths
    std::string path;
    Meeting meeting = Meeting::BothChanged;
    Verdict verdict = Verdict::Clean;
    bool isByObjects = true; ///< version control lets ovrin merge it, and doesn't merge it by lines
    std::vector<std::string>
        gitConflicts;    ///< those that aren't of contents, as git calls them: "modify/delete"
    std::string problem; ///< in a person's words: what git can't settle, or why nothing is known
    nlohmann::json conflicts = nlohmann::json::array(); ///< of its contents
    std::string report;                                 ///< the same in lines for people
};

/// How many scenes there are of each sort.
struct ScenesInSum {
    std::size_t all = 0, conflicting = 0, unknown = 0, byLines = 0;
};

/// The answer to "what would conflict if this were merged", or a part of it.
struct PreviewAnswer {
    NamedCommit ours, theirs;
    std::string question;  ///< a hash of what was asked: parts of the same answer have the same
    std::size_t count = 0; ///< scenes of the whole question
    Part part;
    std::vector<PreviewedScene> scenes; ///< of this part, by their numbers
};

ScenesInSum Sum(const PreviewAnswer& answer);

/// A scene as JSON, and back. Bytes that are no UTF-8 are replaced.
nlohmann::json ToJson(const PreviewedScene& scene);
PreviewedScene SceneOfJson(const nlohmann::json& json);

/// The answer as JSON, and back. Throws Failure for a text that is no answer.
std::string ToJson(const PreviewAnswer& answer);
PreviewAnswer AnswerOfJson(const std::string& text);

} // namespace ovrin
