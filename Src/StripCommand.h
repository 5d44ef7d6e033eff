#pragma once

#include "ExitStatus.h"

struct StripConfig;

/// Reduces the right file to what differs from the left one. Returns Done; Failed, after a message,
/// if that can't be written. Throws YAMLError where a file can't be read.
ExitStatus HandleStripCommand(StripConfig& config);
