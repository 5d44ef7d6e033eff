#pragma once

#include "Conflicts/OpenMerge.h"

#include <string>

namespace ovrin {

struct Repository;

/// The open merge of a scene of which nothing is written down, as version control keeps it, without identity
/// and count. Throws Failure that tells what to do where there is no such merge: one side has removed the
/// file, or the system keeps no versions of it.
OpenMerge ReadUnrecordedMerge(const Repository& repository, const std::string& path);

/// Whether git's index has the texts of a merge for the versions of its file; true where it has no versions.
/// If not the file was merged again since.
bool IsOfIndex(const Repository& repository, const OpenMerge& merge);

} // namespace ovrin
