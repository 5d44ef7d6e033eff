#pragma once

#include "Systems/ChangedFile.h"

namespace ovrin {

struct Repository;

/// Whether git takes the word for a revision, or for two such as A..B and A...B.
bool IsGitRevision(const std::string& word);

/// What "git diff" would compare, with renames. Throws Failure with git's words for what it refuses, and for
/// a path that names nothing.
ChangedFiles ListGitChanges(const Repository& repository, const ComparisonWish& wish);

} // namespace ovrin
