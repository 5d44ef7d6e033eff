#pragma once

#include <sstream>

/// The error texts of the merge command and its pipeline, which are one unit: a later message is shown behind
/// the earlier ones of both.
extern std::stringstream g_DriverErrors;
