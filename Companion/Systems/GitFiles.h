#pragma once

#include <string>

namespace ovrin {

struct Repository;

// What git's own files tell without a process. A merge asks for each of its files, and a process takes
// longer than many a merge.

/// What is checked out.
struct GitHead {
    std::string commit; ///< its whole number; empty ahead of the first commit
    std::string branch; ///< "main"; empty where none is
};

/// Where the files can't tell the commit, git is asked.
GitHead ReadGitHead(const Repository& repository);

/// What a rebase that is under way puts commits onto, as the user named it: "main", "origin/main", a commit;
/// empty if it isn't known.
std::string RebaseTarget(const Repository& repository);

/// The commit that a rebase, or a cherry-pick or revert of several, is at: "3f2a1c9 (Dim the light)"; empty
/// if it isn't known.
std::string CommitAtHand(const Repository& repository);

/// The first digits of a commit's number; anything else as it is.
std::string ShortCommit(const std::string& name);

} // namespace ovrin
