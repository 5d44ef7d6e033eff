#pragma once

#include "TimerStat.h"

#include "Session/StageWatcher.h"

#include <optional>

/// Times the steps of a stage that the library carries out.
class StepTimers final : public ovrin_yaml::StageWatcher {
public:
    explicit StepTimers(TimerStat& stage) : m_Stage(stage) {}

    void Begin(const char* step) override { m_Timer.emplace(m_Stage, step); }
    void End() override { m_Timer.reset(); }

private:
    TimerStat& m_Stage;
    std::optional<TimerStat> m_Timer;
};
