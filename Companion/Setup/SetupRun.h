#pragma once

#include "Setup/Configuration.h"

#include <string>
#include <vector>

namespace ovrin {

/// What a person wants of a set-up.
struct SetupWish {
    std::string system; ///< "git", "hg" or "svn"; empty for all that are installed
    Scope scope = Scope::Global;
    bool isUndo = false;
    bool isDryRun = false;    ///< everything is told, nothing written
    std::string program = {}; ///< how the program is to be called; empty for what is found
};

/// What became of it.
struct SetupReport {
    std::string done;                      ///< for people: each line that was written or taken out, and where
    std::string words;                     ///< what a person should know besides
    std::vector<std::string> changed = {}; ///< the files that were, or would be
    unsigned failures = 0;                 ///< what could not be done, each of which the words tell
};

/// Sets version control up, or takes back what did. Throws Failure if there is nothing that it could be done
/// to; where one of several systems or files fails the others go on.
SetupReport RunSetup(const SetupWish& wish);

} // namespace ovrin
