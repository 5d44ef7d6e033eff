#pragma once

struct StripConfig;

/// Reduces the right file to what differs from the left one. Throws YAMLError where a file can't be read.
int HandleStripCommand(StripConfig& config);
