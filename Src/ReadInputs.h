#pragma once

#include "Diff/MergeRules.h"
#include "Reading/ObjectFile.h"
#include "Repair/YAMLTypeInfo.h"

#include <string>
#include <vector>

class TimerStat;

/// What the user's files tell about the format of object files.
struct RulesAndTypes {
    ovrin_yaml::MergeRules rules;
    ovrin_yaml::YAMLTypeInfoManager types; // not loaded if there is no such file
};

/// Reads the rules and, if there is one, the type info file, before any object file is read. `reading` is the
/// stage that this belongs to, `root` its parent. Throws as SetupRules and SetupTypeInfo do.
RulesAndTypes SetupRulesAndTypes(TimerStat& root, TimerStat& reading, const std::string& rulesFile,
                                 const std::string& typeInfoFile);

/// One object file to be read.
struct InputFile {
    const char* timerName; // of its own reading stage, without threads
    const std::string* path;
    ovrin_yaml::OvrinObjects* objects; // filled; must be empty
};

/// Everything that makes reading fast, with a look at each object for the repair stages
/// (Repair/ObjectTraits.h).
ovrin_yaml::ReaderOptions DefaultReaderOptions();

/// Reads files that are versions of one another, the first being the one that the others share objects with.
/// With threads all are read at once; then all have been tried before the first failure, in the order of
/// `inputs`, is thrown. Without threads the first failure ends it. Throws YAMLError with the path and the
/// fault.
void ReadInputs(TimerStat& parent, bool useThreads, const std::vector<InputFile>& inputs,
                ovrin_yaml::ReaderOptions options = DefaultReaderOptions());
