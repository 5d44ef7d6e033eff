#pragma once

#include "ExitStatus.h"

#include <sstream>
#include <string>

/// The error texts of the merge command and its pipeline, which are one unit: a later message is shown behind
/// the earlier ones of both.
extern std::stringstream g_DriverErrors;

/// Shows the message. Always ExitStatus::Failed.
ExitStatus Fail(const std::string& message);

/// The same for what can't be written to its last byte, by the errno. The empty path is standard output.
ExitStatus FailToWrite(const std::string& path, int error);
