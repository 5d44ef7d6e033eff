#pragma once

#include "Conflicts/ConflictReport.h"
#include "Conflicts/OpenMerge.h"

#include <functional>
#include <optional>
#include <string>
#include <vector>

namespace ovrin {

/// A file of a review.
struct ReviewSource {
    std::string path; ///< any bytes
    SideLabels labels;
    /// Gives the texts of a scene; of two versions the older one is base and ours, the newer one theirs.
    /// Nothing for a file that isn't meant to be a scene. Throws Failure for one that is, and can't be read.
    std::function<std::optional<ThreeTexts>()> read;
};

/// What is to be looked through.
struct ReviewSources {
    std::vector<ReviewSource> files;
    bool isMerge = false; ///< of two sides, in place of two versions
    std::string sides;    ///< of a merge: a sentence that says what the sides are
};

} // namespace ovrin
