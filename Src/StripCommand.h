#pragma once

struct StripConfig;

/// Reduces the right file to what differs from the left one. Returns 0; 1, after a message, if that can't be
/// written. Throws YAMLError where a file can't be read.
int HandleStripCommand(StripConfig& config);
