#pragma once

/// How the process ends. Other values are the wait status of an external tool that failed, of which the
/// system passes on the low eight bits.
enum class ExitStatus : int {
    Done = 0,               // merged, or settled by an external tool; the other commands: done
    Failed = 1,             // after a message; a destination is as it was
    Conflicts = 2,          // merged, with open conflicts
    BrokenDependencies = 3, // the same, and a removal broke what a component requires
};
