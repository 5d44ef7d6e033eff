#pragma once

#include "Systems/ChangedFile.h"

#include <string>
#include <vector>

namespace ovrin {

/// What "ovrin diff" was given.
struct DiffOperands {
    std::vector<std::string> words; ///< revisions, paths or two files
    std::vector<std::string> paths; ///< those that were marked as paths
    bool isStaged = false;
    std::string otherwise; ///< the revision of git where none is given; empty: what "git diff" takes then
};

/// The files that are to be compared: two, if the words are names of two files and no revisions; otherwise
/// what the version control system around the present folder has. Throws Failure for what can't be made out.
ChangedFiles VersionsToCompare(const DiffOperands& operands);

/// The file that git calls its external diff for, with the operands that git gives: path, old file, id and
/// mode, new file, id and mode, and for a rename the new path and words about it; or the path alone of a file
/// that isn't merged yet.
ChangedFiles VersionsForGit(const DiffOperands& operands);

} // namespace ovrin
