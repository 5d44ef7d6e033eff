#pragma once

#include "Session/StageWatcher.h"

#include <condition_variable>
#include <mutex>
#include <string>
#include <thread>

namespace ovrin {

/// A line on standard error that tells what a long piece of work is at, from its second second on. It is
/// wiped at the end, and never there unless standard error is a terminal.
class ProgressLine final : public ovrin_yaml::StageWatcher {
public:
    /// `subject` is what is worked on: "levels/harbour.ovrin", printable.
    explicit ProgressLine(std::string subject);
    ProgressLine(const ProgressLine&) = delete;
    ProgressLine& operator=(const ProgressLine&) = delete;
    ~ProgressLine() { Wipe(); }

    /// Ends it ahead of other words.
    void Wipe();

    void Begin(const char* step) override;
    void End() override {}

private:
    void Show(const std::stop_token& stop);

    const std::string m_Subject;
    std::mutex m_Lock;
    std::condition_variable_any m_Changed;
    const char* m_Step = "";
    std::jthread m_Thread; // none where there is nothing to show; the last member, whose end is waited for
};

} // namespace ovrin
