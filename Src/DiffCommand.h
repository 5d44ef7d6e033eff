#pragma once

#include "ExitStatus.h"

struct DiffConfig;

/// Lists the changes between two object files. Returns Done; Failed, after a message, if that
/// can't be written. Throws YAMLError where a file can't be read.
ExitStatus HandleDiffCommand(DiffConfig& config);
