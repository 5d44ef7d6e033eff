#pragma once

struct DiffConfig;

/// Lists the changes between two object files. Returns 0; 1, after a message, if that can't be
/// written. Throws YAMLError where a file can't be read.
int HandleDiffCommand(DiffConfig& config);
