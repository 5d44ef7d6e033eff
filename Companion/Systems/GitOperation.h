#pragma once

#include <string>

namespace ovrin {

struct Repository;

/// What git is in the midst of, as conflicts leave it.
struct GitOperation {
    std::string action;   ///< "merge", "rebase", "cherry-pick", "revert", "am"; empty: nothing
    std::string proceed;  ///< the command that concludes it once all is settled
    std::string giveUp;   ///< the one that takes it back
    std::string incoming; ///< the name of the commit that is merged in: "MERGE_HEAD"; empty: not known
};

/// Looks at the files that git keeps of it; no program is started.
GitOperation GitOperationIn(const Repository& repository);

} // namespace ovrin
