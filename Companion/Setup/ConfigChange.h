#pragma once

#include "Setup/Configuration.h"

#include <string>
#include <vector>

namespace ovrin {

/// What is to become of a file that takes lines of the program.
struct ConfigChange {
    enum class Kind {
        None,    ///< the lines are as they should be: there, or gone
        Make,    ///< a file is made of them
        Add,     ///< they are added
        Replace, ///< other lines stand in their place, which an earlier set-up wrote
        Remove,  ///< they are taken out
        Delete,  ///< the file is removed, which was made for them
    };
    Kind kind = Kind::None;
    std::string path;
    std::string lines = {}; ///< those that come or go, without their marks
    std::string kept = {};  ///< those that somebody else wrote among them, and that stay
    std::string before = {}, after = {};
    unsigned folders = 0; ///< to be made above the file, or removed if they are empty
};

/// What has to be done so that the file has its lines. Throws Failure where that can't be: a file that can't
/// be read, a script of another language.
ConfigChange PlanLines(const Configuration& configuration);

/// What has to be done so that it hasn't.
ConfigChange PlanRemoval(const Configuration& configuration);

/// Does it. Throws Failure if it can't be done or the file was changed since; nothing has happened then.
void CarryOut(const ConfigChange& change);

} // namespace ovrin
