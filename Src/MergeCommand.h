#pragma once

#include "ExitStatus.h"

struct MergeConfig;

/// Serves one merge by the smart merge, an external tool or both, and writes the destination. Fills in the
/// premerge paths of `config` where they are needed and empty. Returns the exit status of the process;
/// failures have been reported then. Throws std::bad_alloc.
ExitStatus ProcessMergeCommand(MergeConfig& config);
