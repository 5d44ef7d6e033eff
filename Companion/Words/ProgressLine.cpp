#include "Words/ProgressLine.h"

#include "Descriptor.h"

#include <chrono>
#include <string_view>
#include <system_error>
#include <unistd.h>

namespace ovrin {

namespace {

constexpr std::chrono::seconds kQuietTime{1};
constexpr std::string_view kWipe = "\r\033[K";

/// The steps of the engine, which speak of left and right, in words for people.
const char* WordsFor(std::string_view step) {
    if (step.starts_with("Read")) return "reading";
    if (step.find("diff") != std::string_view::npos) return "comparing";
    return "merging";
}

void WriteLine(std::string_view text) {
    WriteFully(STDERR_FILENO, text.data(), text.size());
}

} // namespace

ProgressLine::ProgressLine(std::string subject) : m_Subject(std::move(subject)) {
    if (!isatty(STDERR_FILENO)) return;
    try {
        m_Thread = std::jthread([this](const std::stop_token& stop) { Show(stop); });
    } catch (const std::system_error&) {
        // It is done without a word, then.
    }
}

void ProgressLine::Wipe() {
    m_Thread.request_stop();
    if (m_Thread.joinable()) m_Thread.join();
}

void ProgressLine::Begin(const char* step) {
    const std::lock_guard lock(m_Lock);
    m_Step = step;
    m_Changed.notify_all();
}

void ProgressLine::Show(const std::stop_token& stop) {
    std::unique_lock lock(m_Lock);
    m_Changed.wait_for(lock, stop, kQuietTime, [] { return false; });
    const bool isShown = !stop.stop_requested();
    while (!stop.stop_requested()) {
        const char* const step = m_Step;
        WriteLine(std::string(kWipe) + m_Subject + ": " + WordsFor(step) + "...");
        m_Changed.wait(lock, stop, [&] { return m_Step != step; });
    }
    if (isShown) WriteLine(kWipe);
}

} // namespace ovrin
