#pragma once

#include "OutputStream.h"

#include <functional>
#include <string>

class Descriptor;

/// What a file that is written outlives.
enum class Durability {
    Synced,   ///< a failure of the machine too, which costs a few milliseconds and more
    Unsynced, ///< the end of the process; after a failure of the machine the old one may stand there again
    Passing,  ///< the end of the process alone: what is removed soon, or can be made again
};

/// Fills a file.
using OutputWriter = std::function<void(OutputStream&)>;

/// Lets `write` fill the file at `path`, which is truncated, or standard output where the path is empty.
/// Returns 0 when all is written to the last byte, the errno of the first failure otherwise.
int WriteOutput(const std::string& path, const OutputWriter& write);

/// The same for an open file, which is closed.
int WriteAndClose(Descriptor file, const OutputWriter& write);
