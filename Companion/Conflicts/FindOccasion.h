#pragma once

#include "Conflicts/OpenMerge.h"

#include <optional>
#include <string>

namespace ovrin {

struct Caller;
struct Repository;

/// How version control calls the sides in the options of a merge. A git that doesn't know the words leaves
/// "%S", "%X" and "%Y", which are as good as nothing.
struct GivenLabels {
    std::string base, ours, theirs;
};

/// What the merge that this process was started for is to the one who makes it: the labels that were given,
/// where they say anything, and else what the caller, the environment and the repository's files tell. What
/// isn't known stays empty; nothing is thrown.
Occasion FindOccasion(const std::optional<Repository>& repository, const std::optional<Caller>& caller,
                      const GivenLabels& given);

/// Whether a merge that this command makes leaves no trace in the working tree, so that nothing is open in it
/// afterwards.
bool IsWithoutTree(const std::optional<Caller>& caller);

} // namespace ovrin
