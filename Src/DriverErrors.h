#pragma once

#include <sstream>
#include <string>

/// The error texts of the merge command and its pipeline, which are one unit: a later message is shown behind
/// the earlier ones of both.
extern std::stringstream g_DriverErrors;

/// Shows the message. Always 1, the exit status of a failed command.
int Fail(const std::string& message);

/// The same for what can't be written to its last byte, by the errno. The empty path is standard output.
int FailToWrite(const std::string& path, int error);
