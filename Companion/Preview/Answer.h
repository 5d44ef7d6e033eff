#pragma once

#include "Preview/Sharing.h"
#include "Systems/Git.h"

#include <cstddef>
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
enum class Meeting { BothChanged, BothAdded, OursRemoved, TheirsRemoved, Misplaced };

/// A scene that both sides changed, and what would become of it.
struct PreviewedScene {
    std::size_t number = 0; ///< among those of the whole question, from 1, in the order of their paths
    std::string path;
    Meeting meeting = Meeting::BothChanged;
    Verdict verdict = Verdict::Clean;
    bool isByObjects = true;              ///< version control would let ovrin merge it; else it merges by lines
    std::vector<std::string> gitConflicts; ///< git's names of those that aren't of contents: "modify/delete"
    std::string problem;                  ///< in a person's words; why nothing is known, or what git can't settle
    std::string conflicts;                ///< JSON, a list of them as Conflicts/Conflict has it
    std::size_t conflictCount = 0;
    std::string report; ///< the conflicts in lines for people
};

/// The answer to "what would conflict if this were merged", or a part of it.
struct PreviewAnswer {
    NamedCommit ours, theirs;
    std::string question;  ///< what was asked, shortened to a hash: parts of the same have the same
    std::size_t count = 0; ///< scenes of the whole question
    Part part;
    std::vector<PreviewedScene> scenes; ///< of this part, by their numbers
};

/// The answer as JSON, and back. Throws Failure for a text that is no answer.
std::string AnswerToJson(const PreviewAnswer& answer);
PreviewAnswer AnswerOfJson(const std::string& text);

/// A scene alone, on its way from one process to another.
std::string SceneToJson(const PreviewedScene& scene);
PreviewedScene SceneOfJson(const std::string& text);

} // namespace ovrin
