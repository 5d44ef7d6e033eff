#pragma once

#include "Conflicts/OpenMerge.h"

#include <string>
#include <vector>

namespace ovrin {

class OpenMerges;
struct Repository;

/// The open merges of a working tree, as version control sees them now.
struct LiveMerges {
    /// Written down, and under way still: in the order of their paths, without texts.
    std::vector<OpenMerge> live;
    /// Written down, but over: committed, given up, or merged again in another way.
    std::vector<OpenMerge> stale;
    /// Scenes that version control holds for unmerged and of which nothing is written down: another program
    /// merged them, or the disk was full. In order.
    std::vector<std::string> unrecorded;
};

/// Looks at the records and asks version control what has become of them; nothing is changed.
///
/// A merge is under way as long as its file is unmerged. In git that ends with "git add", whoever calls it,
/// so there it goes on until the operation that it came from has ended, by a commit or without one. One that
/// leaves no trace, such as the application of a stash, has ended when the file is again as in the last
/// commit.
LiveMerges FindLiveMerges(const Repository& repository, const OpenMerges& store);

} // namespace ovrin
