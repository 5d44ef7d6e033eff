#pragma once

#include "CommandSettings.h"
#include "ExitStatus.h"

#include <string>
#include <vector>

/// Set by -h. Nothing depends on it: there are no dialogs to suppress.
extern bool gHeadlessEnabled;

/// The arguments of the process, the program's name first. The parsers take the words they use out of it.
struct CommandLineArguments {
    CommandLineArguments(int count, const char* const* values) : args(values, values + count) {}
    std::vector<std::string> args;
};

/// Each fills `config` from the arguments at `first` and behind: options, then paths. Words behind the paths
/// are ignored. Returns false after an error message and the usage text.
bool ParseMergeArgs(CommandLineArguments& arguments, int first, MergeConfig& config);
bool ParseDiffArgs(CommandLineArguments& arguments, int first, DiffConfig& config);
bool ParseStripArgs(CommandLineArguments& arguments, int first, StripConfig& config);

/// Runs the command the arguments name. What a command throws passes
/// through, but for a merge, which reports its failures.
ExitStatus InnerMain(CommandLineArguments& arguments);
