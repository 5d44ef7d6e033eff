#pragma once

#include "Commands/Outcome.h"
#include "Conflicts/FindOccasion.h"
#include "Scenes/SceneRules.h"

#include <string>

namespace ovrin {

/// The files of a merge as version control hands them over.
struct FileMerge {
    std::string base, ours, theirs; ///< to read; an empty base means that both sides added the scene
    std::string result;             ///< may be one of them
    std::string path;               ///< of the scene, by which it is told and written down
    GivenLabels labels;
    FormatFiles format;
};

/// Merges and brings the result into its place, or leaves that as it was. Done only if all is settled and the
/// result is there; LeftOpen once open conflicts are told on standard error and, in a working tree, written
/// down. Throws Failure for all else.
Outcome Merge(const FileMerge& files);

} // namespace ovrin
