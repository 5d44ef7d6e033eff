#pragma once

#include "CommandTable.h"

#include <string>
#include <vector>

/// The arguments of the process, the program's name first. The parser takes the words it uses out of it.
struct CommandLineArguments {
    CommandLineArguments(int count, const char* const* values) : args(values, values + count) {}
    std::vector<std::string> args;
};

/// Fills `settings` from the arguments behind the command: options, then paths. Words behind the paths are
/// ignored. Returns false after an error message and the usage text.
bool ParseArguments(const Command& command, CommandLineArguments& arguments, MergeConfig& settings);

/// Runs the command the arguments name. What a command throws passes through, but for a merge, which reports
/// its failures.
ExitStatus InnerMain(CommandLineArguments& arguments);
