#include "DriverErrors.h"

#include "ErrMsg.h"

#include <cstring>

std::stringstream g_DriverErrors;

ExitStatus Fail(const std::string& message) {
    g_DriverErrors << message << '\n';
    ErrMsg(g_DriverErrors);
    return ExitStatus::Failed;
}

ExitStatus FailToWrite(const std::string& path, int error) {
    return Fail("Cannot write '" + (path.empty() ? "-" : path) + "': " + std::strerror(error));
}
