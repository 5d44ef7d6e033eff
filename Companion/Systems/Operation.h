#pragma once

#include <string>

namespace ovrin {

struct Repository;

/// What a version control system is in the midst of, as conflicts leave it.
struct Operation {
    std::string action;   ///< "merge", "rebase", "cherry-pick", "revert", "am", "graft"...; empty: not known
    std::string proceed;  ///< the command that concludes it once all is settled; empty: nothing is to be done
    std::string giveUp;   ///< the one that takes it back; empty if there is none
    std::string incoming; ///< git's name of the commit that comes in, "MERGE_HEAD"; empty: not known
};

/// Looks at the files that the system keeps of it; no program is started.
Operation OperationIn(const Repository& repository);

/// The file that is there as long as a process of git or Mercurial changes the working tree.
std::string LockOf(const Repository& repository);

/// Whether a process of git or Mercurial is changing the working tree: what it has done so far isn't known
/// from its files yet.
bool IsAtWork(const Repository& repository);

} // namespace ovrin
