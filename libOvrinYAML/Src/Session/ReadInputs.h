#pragma once

#include "Reading/ReaderOptions.h"
#include "Session/InputFile.h"
#include "Session/Thread.h"
#include "Values/OvrinObjects.h"

#include <vector>

namespace ovrin_yaml {

class StageWatcher;

/// One of several files that are read together.
struct FileReading {
    const char* step; ///< the name of its reading, where it is a step of its own
    const InputFile* input;
    OvrinObjects* objects; ///< filled; must be empty
};

/// Everything that makes reading fast, with a look at each object for the repair stages
/// (Repair/ObjectTraits.h).
ReaderOptions DefaultReaderOptions();

/// Whether all files together are, as far as their sizes are known, so small that threads cost more than they
/// bring.
bool IsLittleWork(const std::vector<FileReading>& readings, Threads threads);

/// Reads files that are versions of one another, the first being the one that the others share objects with.
/// With threads all are read at once, in a single step; then all have been tried before the first failure, in
/// the order of `readings`, is thrown. Without threads the first failure ends it.
/// Throws MergeError, or std::bad_alloc where there is no memory.
void ReadInputs(const std::vector<FileReading>& readings, Threads threads, StageWatcher* watcher = nullptr,
                ReaderOptions options = DefaultReaderOptions());

} // namespace ovrin_yaml
