#pragma once

#include "Systems/ChangedFile.h"

namespace ovrin {

struct Repository;

/// What "hg diff" or "svn diff" would compare: the working copy with what it came from or with the first
/// revision that is wished for, or two revisions. Renames aren't followed. Throws Failure with the system's
/// words for what it refuses.
ChangedFiles ListOtherChanges(const Repository& repository, const ComparisonWish& wish);

} // namespace ovrin
