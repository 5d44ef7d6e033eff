#pragma once

namespace ovrin {

/// How every command of the program ends, as its exit status.
enum class Outcome : int {
    Done = 0,     ///< done, and nothing is left to do
    LeftOpen = 1, ///< done, and told that there is something left: open conflicts, findings, problems
    Failed = 2,   ///< could not be done, after a message; nothing was changed
};

} // namespace ovrin
