#pragma once

#include "Document/OvrinObjects.h"

#include <string>
#include <vector>

class TimerStat;

/// One object file to be read.
struct InputFile {
    const char* timerName; // of its own reading stage, without threads
    const std::string* path;
    ovrin_yaml::OvrinObjects* objects; // filled; must be empty
};

/// Reads the files, each on a thread of its own if wanted. Then all have been read to their end before the
/// first failure, in the order of `inputs`, is thrown; without threads the first one ends it.
void ReadInputs(TimerStat& parent, bool useThreads, const std::vector<InputFile>& inputs);
