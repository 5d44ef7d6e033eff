#pragma once

#include <chrono>
#include <string>

namespace ovrin {

/// A line on standard error that says how far a command has come: on a terminal alone, and only where the
/// command takes longer than a second. It is gone at the end.
class ProgressCount {
public:
    ProgressCount();
    ProgressCount(const ProgressCount&) = delete;
    ProgressCount& operator=(const ProgressCount&) = delete;
    ~ProgressCount();

    /// Printable text, shorter than a line. May be called as often as one likes.
    void Tell(const std::string& text);

private:
    using Clock = std::chrono::steady_clock;

    const bool m_IsTerminal;
    Clock::time_point m_Next; // when the line may change
    bool m_IsShown = false;
};

} // namespace ovrin
