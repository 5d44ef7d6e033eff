#include "TimerStat.h"

#include <ostream>

TimerStat::TimerStat(std::string name, std::ostream* output)
    : m_Depth(0), m_Output(output), m_Name(std::move(name)) {}

TimerStat::TimerStat(TimerStat& parent, std::string name)
    : m_Depth(parent.m_Depth + 1), m_Output(parent.m_Output), m_Name(std::move(name)) {}

TimerStat::~TimerStat() {
    if (!m_Output) return;
    const auto elapsed = std::chrono::duration_cast<std::chrono::milliseconds>(Clock::now() - m_Start);
    *m_Output << std::string(static_cast<std::size_t>(2 * m_Depth), ' ') << m_Name << ": " << elapsed.count()
              << std::endl;
}
