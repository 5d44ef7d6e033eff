#include "Words/ProgressCount.h"

#include <iostream>
#include <unistd.h>

namespace ovrin {

namespace {

constexpr std::chrono::milliseconds kFirst(1000), kBetween(100);
constexpr const char* kCleared = "\r\x1b[K"; // to the line's beginning, and all of it away

} // namespace

ProgressCount::ProgressCount() : m_IsTerminal(isatty(STDERR_FILENO) == 1), m_Next(Clock::now() + kFirst) {}

ProgressCount::~ProgressCount() {
    if (m_IsShown) std::cerr << kCleared << std::flush;
}

void ProgressCount::Tell(const std::string& text) {
    const Clock::time_point now = Clock::now();
    if (!m_IsTerminal || now < m_Next) return;
    m_Next = now + kBetween;
    m_IsShown = true;
    std::cerr << kCleared << text << std::flush;
}

} // namespace ovrin
