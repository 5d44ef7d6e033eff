#pragma once

#include <string>
#include <vector>

namespace ovrin {

struct Repository;

/// The files that version control holds for unmerged, by their paths from the top of the working tree, in
/// order. Throws Failure with what it says where it fails.
std::vector<std::string> UnmergedFiles(const Repository& repository);

/// Tells version control that the files are merged, as they stand.
void MarkMerged(const Repository& repository, const std::vector<std::string>& paths);

} // namespace ovrin
