#pragma once

#include "Commands/Outcome.h"

#include <functional>
#include <span>

namespace CLI {
class App;
}

namespace ovrin {

/// What a command does once its options are known. Throws Failure.
using Action = std::function<Outcome()>;

/// A command of the program, as it stands on the command line.
struct Command {
    const char* name;
    const char* summary; ///< one line for the list of commands
    /// Adds the command's options and operands to `command`, and returns what to do with them.
    Action (*describe)(CLI::App& command);
};

/// All commands, in the order in which they are told.
std::span<const Command> Commands();

} // namespace ovrin
