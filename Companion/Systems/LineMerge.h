#pragma once

#include <optional>
#include <string>

namespace ovrin {

/// A merge of three texts by their lines.
struct LineMerge {
    std::string text; ///< with conflict markers where both sides changed the same lines
    int conflicts;    ///< how many of these there are; git counts up to 127
};

/// Merges three files by lines, as git does with all that nobody gives to another driver. Nothing where git
/// is not installed. Throws Failure with git's words where it fails.
std::optional<LineMerge> MergeLines(const std::string& base, const std::string& ours,
                                    const std::string& theirs);

} // namespace ovrin
