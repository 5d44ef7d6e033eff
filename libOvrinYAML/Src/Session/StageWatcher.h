#pragma once

namespace ovrin_yaml {

/// Is told of the steps of a stage, by those who want to time or show them. Steps don't stand inside each
/// other, and are told on the thread that called for the stage.
class StageWatcher {
public:
    virtual void Begin(const char* step) = 0;
    virtual void End() = 0;

protected:
    ~StageWatcher() = default;
};

/// A step as long as it lasts. There may be nobody watching.
class WatchedStep {
public:
    WatchedStep(StageWatcher* watcher, const char* step) : m_Watcher(watcher) {
        if (m_Watcher) m_Watcher->Begin(step);
    }
    ~WatchedStep() {
        if (m_Watcher) m_Watcher->End();
    }
    WatchedStep(const WatchedStep&) = delete;
    WatchedStep& operator=(const WatchedStep&) = delete;

private:
    StageWatcher* const m_Watcher;
};

} // namespace ovrin_yaml
