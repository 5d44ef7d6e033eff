#pragma once

#include "Words/Failure.h"

#include <string>

namespace ovrin {

/// What fails because a place can't be written to, and not because of the scene.
class WriteFailure : public Failure {
public:
    using Failure::Failure;
};

/// Why something couldn't be written, by the errno, and what to do about it where that is a matter of room.
std::string WhyNotWritten(int error);

} // namespace ovrin
