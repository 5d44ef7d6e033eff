#pragma once

#include "Systems/Process.h"

#include "Descriptor.h"

#include <array>
#include <sys/types.h>

namespace ovrin {

/// A pipe that programs don't inherit.
struct Pipe {
    Descriptor read, write;

    /// Throws Failure.
    Pipe();
};

/// Starts a program with these standard streams, signals as programs expect them, and the folder,
/// environment and session of the setting; the rest of the setting is the caller's business. Throws Failure
/// if it can't be started. Every program that was started must be waited for.
pid_t StartProcess(const CommandWords& command, const ProcessSetting& setting,
                   const std::array<int, 3>& streams);

/// Waits for the end of a program. Returns its status as in ProcessResult.
int WaitForProcess(pid_t child);

} // namespace ovrin
