#pragma once

#include "Systems/Process.h"

#include <string>
#include <vector>

namespace ovrin {

struct Repository;

// Files of a working tree, by their paths from its top, in order. Both throw Failure with what the system
// says where it fails.

/// Those that version control keeps.
std::vector<std::string> TrackedFiles(const Repository& repository);

/// Those that differ from the last commit, and those that version control neither keeps nor is told to
/// ignore. Subversion doesn't look into folders that are new.
std::vector<std::string> DifferingFiles(const Repository& repository);

/// What Mercurial and Subversion are started with, so that a program can read their lists: without what the
/// user likes to see, and with all letters in paths.
ProcessSetting PlainSetting(const Repository& repository);

} // namespace ovrin
