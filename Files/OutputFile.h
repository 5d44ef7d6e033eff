#pragma once

#include "OutputStream.h"

#include <functional>
#include <string>

class Descriptor;

/// Whether what is written outlives a failure of the machine too, or the end of the process alone. The first
/// costs a few milliseconds and more.
enum class Durability { Synced, Unsynced };

/// Fills a file.
using OutputWriter = std::function<void(OutputStream&)>;

/// Lets `write` fill the file at `path`, which is truncated, or standard output where the path is empty.
/// Returns 0 when all is written to the last byte, the errno of the first failure otherwise.
int WriteOutput(const std::string& path, const OutputWriter& write);

/// The same for an open file, which is closed.
int WriteAndClose(Descriptor file, const OutputWriter& write);
