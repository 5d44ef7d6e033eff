#pragma once

#include "Systems/ChangedFile.h"

#include <string>

namespace ovrin {

/// Two versions of a file that is meant to be a scene.
struct ScenePair {
    /// The texts; a version that isn't there is a scene without objects.
    std::string before, after;
    bool isScene = false; ///< both can be taken for scenes; whether they can be read is another question
    /// Why not, for a file that is meant to be a scene; a sentence without a full stop. Empty for any other
    /// file.
    std::string reason;
};

/// Reads the versions as far as it takes to tell that they are no scenes. Throws Failure for versions that
/// can't be had.
ScenePair ReadScenePair(const ChangedFile& changed);

} // namespace ovrin
