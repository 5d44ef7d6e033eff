#pragma once

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

/// Loads the rules file of that name, "auto" being the one beside the executable. Called once per command,
/// before any file is read. Throws YAMLError if the file can't be read and std::runtime_error for a bad line.
void SetupRules(const std::string& rulesFile);

/// Loads the type information of that object file into the library. Called at most once per command, before
/// threads are started. Throws YAMLError if the file can't be read and std::runtime_error for a bad entry.
void SetupTypeInfo(const std::string& typeInfoFile);

/// Loads the rules and, if there is one, the type info file, before any object file is read. `reading` is the
/// stage that this belongs to, `root` its parent. Throws as SetupRules and SetupTypeInfo do.
void SetupRulesAndTypes(TimerStat& root, TimerStat& reading, const std::string& rulesFile,
                        const std::string& typeInfoFile);
