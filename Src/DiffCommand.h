#pragma once

struct DiffConfig;

/// Lists the changes between two object files. Throws YAMLError where a file can't be read.
int HandleDiffCommand(DiffConfig& config);
