#pragma once

#include <chrono>
#include <iosfwd>
#include <string>

/// Times a stage. At its end it prints a line "name: 12", the time in whole milliseconds, behind two blanks
/// for each level below the root; so children print before their parents. A tree of timers belongs to one
/// thread.
class TimerStat {
public:
    /// A root. `output` may be null, which silences the whole tree.
    TimerStat(std::string name, std::ostream* output);
    /// A stage within `parent`.
    TimerStat(TimerStat& parent, std::string name);
    TimerStat(const TimerStat&) = delete;
    TimerStat& operator=(const TimerStat&) = delete;
    ~TimerStat();

private:
    using Clock = std::chrono::steady_clock;

    const Clock::time_point m_Start = Clock::now();
    const int m_Depth;
    std::ostream* const m_Output;
    const std::string m_Name;
};
