#pragma once

#include <stdexcept>

namespace ovrin {

/// What ends a command without a result. The text is for people: what happened, to what, and what to do next;
/// without a full stop at its end where it is one sentence.
class Failure : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

} // namespace ovrin
