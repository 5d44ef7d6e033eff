#pragma once

#include "Diff/MergeRules.h"
#include "Repair/YAMLTypeInfo.h"
#include "Session/Thread.h"

#include <string>

class TimerStat;

/// What the option for threads means to the library.
inline ovrin_yaml::Threads ThreadsOf(bool useThreads) {
    return useThreads ? ovrin_yaml::Threads::WhereWorthwhile : ovrin_yaml::Threads::None;
}

/// What the user's files tell about the format of object files.
struct RulesAndTypes {
    ovrin_yaml::MergeRules rules;
    ovrin_yaml::YAMLTypeInfoManager types; // not loaded if there is no such file
};

/// Reads the rules and, if there is one, the type info file, before any object file is read. `reading` is the
/// stage that this belongs to, `root` its parent. Throws as SetupRules and SetupTypeInfo do.
RulesAndTypes SetupRulesAndTypes(TimerStat& root, TimerStat& reading, const std::string& rulesFile,
                                 const std::string& typeInfoFile);
