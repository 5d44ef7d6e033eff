#pragma once

#include "CommandSettings.h"
#include "ExitStatus.h"

#include <array>
#include <span>
#include <string>
#include <string_view>

/// One option of the command line. From these records come the parser, the completion files of the shells and
/// the tables of the manual and the README.
struct Option {
    std::string_view word;
    std::string_view value;   // what the argument behind it is, which then belongs to it; empty: stands alone
    std::string_view meaning; // a line for a person
    bool isInUsage;           // the usage text, which never changes, leaves some out
    std::string_view notAFile; // a value that names no file; empty: there is none
    /// Takes the option, or what stands behind it, into the settings. Returns why it is refused; empty: it
    /// isn't.
    std::string_view (*take)(MergeConfig& settings, std::string& value);
};

/// A path behind the options.
struct PathArgument {
    std::string_view name;
    std::string MergeConfig::*target;
};

struct Command {
    std::string_view word;
    std::string_view meaning;
    bool isInUsage;
    std::array<std::span<const Option>, 2> options;
    std::span<const PathArgument> paths;
    std::size_t requiredPaths; // none: what stands behind the word is ignored
    ExitStatus (*run)(MergeConfig& settings);
};

/// The commands; the first takes the options of all others.
extern const std::span<const Command> kCommands;

/// Null for words that are none of them.
const Command* FindCommand(std::string_view word);
const Option* FindOption(const Command& command, std::string_view word);
