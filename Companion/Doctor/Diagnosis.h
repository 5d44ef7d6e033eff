#pragma once

#include <functional>
#include <string>

namespace ovrin {

/// How a check ended. HealthName has the names in this order.
enum class Health {
    Fine,    ///< nothing is wrong
    Note,    ///< something could be better; no problem
    Problem, ///< something is wrong
    Fixed,   ///< it was, and isn't any more
    Skipped, ///< there is nothing to check
    Unknown, ///< it could not be looked at
};

/// What a check found, for people.
struct Diagnosis {
    Health health = Health::Fine;
    std::string text;      ///< what is so, of what
    std::string cure = {}; ///< what to do; empty where nothing is to be done
    /// Does what can be done safely, and tells what it did. Empty where that is left to a person. Throws
    /// Failure.
    std::function<std::string()> fix = {};
};

} // namespace ovrin
