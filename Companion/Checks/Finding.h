#pragma once

#include "Checks/FindingCodes.h"

#include <cstddef>
#include <string>
#include <vector>

namespace ovrin {

/// Something that is wrong with a scene.
struct Finding {
    Code code;
    std::size_t line = 0;     ///< in the file, from 1; 0 for the file as a whole
    std::string object = {};  ///< the object's id; empty if it is about the file
    std::string name = {};    ///< what a person knows the object by
    std::string detail = {};  ///< tells it from others of one code and object, whatever lines they stand in
    std::string message = {}; ///< the rest of a sentence that begins with the name
};

/// A scene with what was found in it.
struct CheckedScene {
    std::string file;
    std::vector<Finding> findings = {};
    std::string failure = {}; ///< why it couldn't be checked; empty if it could
    bool isOther = false;     ///< it is no scene, and need not be one
};

} // namespace ovrin
