#pragma once

#include "Commands/DiffVersions.h"
#include "Review/ReviewSource.h"

#include <string>
#include <vector>

namespace ovrin {

/// What "ovrin review" was given: what "ovrin diff" takes, with the last commit of git where no revision is
/// given, or three files, or the versions that a merge put together. Throws Failure for what can't be made
/// out.
ReviewSources VersionsToReview(DiffOperands operands);

/// The scenes that both sides of a merge commit of git changed, with their common history, as git finds it.
/// The result is what merging them gives, whatever was committed. `paths` are files and folders, from the
/// present folder; none: all. Throws Failure for what is no merge, and for a path without such a scene.
ReviewSources SidesOfMerge(const std::string& revision, const std::vector<std::string>& paths);

} // namespace ovrin
