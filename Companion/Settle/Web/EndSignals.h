#pragma once

#include "Systems/ChildProcess.h"

#include <array>
#include <csignal>

namespace ovrin {

/// While it lives, signals that ask the program to end (Ctrl-C, a closed terminal, kill) can be waited for.
/// Each ends the program at once when it comes again. One at a time.
class EndSignals {
public:
    /// Throws Failure.
    EndSignals();
    EndSignals(const EndSignals&) = delete;
    EndSignals& operator=(const EndSignals&) = delete;
    ~EndSignals();

    /// Can be read once a signal has come.
    int File() const { return m_Pipe.read.Get(); }

private:
    static constexpr std::array<int, 3> kSignals = {SIGINT, SIGTERM, SIGHUP};

    Pipe m_Pipe;
    std::array<struct sigaction, kSignals.size()> m_Before;
};

} // namespace ovrin
