#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <span>
#include <string>

namespace ovrin {

/// How much is done at a time. Sizes are in whatever the sizes of the work are in.
struct WorkLimits {
    std::size_t processes = 1;
    std::uint64_t perProcess = 0; ///< what a process may do before another takes its place
    std::uint64_t together = 0;   ///< what all processes that live may have done
};

/// How the work on a piece ended.
struct WorkerAnswer {
    std::optional<std::string>
        text;        ///< what the work returned; nothing if its process came to an end instead
    std::string end; ///< how it did: "killed by signal 9"
};

/// Calls work(index) for each of `sizes` in processes that are copies of this one, and take(index, answer)
/// here once it is done: the largest piece first, in no order that means anything. For work whose memory
/// comes back only at the end of a process, or that must not take this one along: a process that comes to an
/// end costs the piece that it worked on. A piece that is larger than the limits is worked on alone.
///
/// Only for a process without other threads. An exception of `take` ends the other processes. Throws Failure
/// if no process can be started.
void WorkInProcesses(std::span<const std::uint64_t> sizes, const WorkLimits& limits,
                     const std::function<std::string(std::size_t)>& work,
                     const std::function<void(std::size_t, WorkerAnswer)>& take);

/// While it lives, copies of this process close a descriptor first: whoever waits for the end of what it
/// leads to doesn't wait for them, too. One at a time.
class ClosedInCopies {
public:
    explicit ClosedInCopies(int descriptor);
    ClosedInCopies(const ClosedInCopies&) = delete;
    ClosedInCopies& operator=(const ClosedInCopies&) = delete;
    ~ClosedInCopies();
};
/// What a copy of this process that is made elsewhere calls first.
void CloseInCopy();

} // namespace ovrin
