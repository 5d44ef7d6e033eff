#pragma once

#include "Diff/MergeRules.h"
#include "Repair/YAMLTypeInfo.h"
#include "Session/InputFile.h"
#include "Session/Thread.h"

#include <string>

class TimerStat;

/// The object file at `path`. Taking it throws YAMLError for a file that can't be read.
ovrin_yaml::InputFile FileInput(const std::string& path);

/// What the option for threads means to the library.
inline ovrin_yaml::Threads ThreadsOf(bool useThreads) {
    return useThreads ? ovrin_yaml::Threads::WhereWorthwhile : ovrin_yaml::Threads::None;
}

/// Reads the rules file of that name, "auto" being the one beside the executable. Throws YAMLError if the
/// file can't be read and std::runtime_error for a bad line.
ovrin_yaml::MergeRules SetupRules(const std::string& rulesFile);

/// Reads the type information of that object file. Throws YAMLError if the file can't be read and
/// std::runtime_error for a bad entry.
ovrin_yaml::YAMLTypeInfoManager SetupTypeInfo(const std::string& typeInfoFile);

/// What the user's files tell about the format of object files.
struct RulesAndTypes {
    ovrin_yaml::MergeRules rules;
    ovrin_yaml::YAMLTypeInfoManager types; // not loaded if there is no such file
};

/// Reads the rules and, if there is one, the type info file, before any object file is read. `reading` is the
/// stage that this belongs to, `root` its parent. Throws as SetupRules and SetupTypeInfo do.
RulesAndTypes SetupRulesAndTypes(TimerStat& root, TimerStat& reading, const std::string& rulesFile,
                                 const std::string& typeInfoFile);
