#pragma once

#include <functional>
#include <string>
#include <vector>

namespace ovrin {

struct Repository;

/// A scene that is to be checked.
struct SceneToCheck {
    std::string name; ///< as the user gave it, or its path from the top of the working tree
    std::string path; ///< that path, for scenes of a working tree; empty if it isn't known
    /// Its bytes; on any thread. Throws Failure. Null for a scene that is unmerged in the index and has none
    /// there.
    std::function<std::string()> take;
    /// Nobody named it, and the ending of its name is also that of files that are no scenes.
    bool mayBeOther = false;
};

/// The named files; "-" is standard input. `repository` is the one around, or null.
std::vector<SceneToCheck> NamedScenes(const std::vector<std::string>& files, const Repository* repository);

// The following throw Failure for a system that can't tell, with the way out.

/// The scenes that the next commit changes, with the bytes that it will have.
std::vector<SceneToCheck> StagedScenes(const Repository& repository);
/// Those that version control keeps, as they stand in the working tree.
std::vector<SceneToCheck> AllScenes(const Repository& repository);
/// Those that are new or changed since the last commit, likewise.
std::vector<SceneToCheck> ChangedScenes(const Repository& repository);

} // namespace ovrin
