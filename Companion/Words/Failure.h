#pragma once

#include <stdexcept>

namespace ovrin {

/// What ends a command without a result. The text is for people: what happened, to what, and what to do next;
/// without a full stop at its end where it is one sentence.
class Failure : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/// What fails because of a value that the user set, in an option, a variable or a configuration, and not
/// because of the scene.
class BadSetting : public Failure {
public:
    using Failure::Failure;
};

} // namespace ovrin
