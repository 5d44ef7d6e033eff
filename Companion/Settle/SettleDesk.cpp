#include "Settle/SettleDesk.h"

#include "Conflicts/DecisionPath.h"
#include "Settle/Meaning.h"
#include "Settle/Steps.h"
#include "Words/Failure.h"

#include <algorithm>

namespace ovrin {

namespace {

void DecideOrFail(SettleSession& session, const std::vector<Decision>& decisions) {
    if (!session.Decide(decisions).empty())
        throw Failure("This can't be decided by itself: a decision about what it belongs to settles it. Take "
                      "that back, or decide there");
}

} // namespace

SettleDesk::SettleDesk(SettleScenes& scenes) : m_Scenes(scenes) {
    for (const auto& session : Scenes()) m_Words.push_back(std::make_unique<ConflictWords>(session->Merge()));
    Refresh();
}

void SettleDesk::Refresh() {
    m_Items.clear();
    m_Problems.clear();
    m_Open = m_Proposed = 0;
    for (std::size_t scene = 0; scene < Scenes().size(); ++scene) {
        const SettleSession& session = *Scenes()[scene];
        for (const SettleSession::Met& met : session.Conflicts()) {
            const bool isSame = !m_Items.empty() && m_Items.back().scene == scene &&
                                m_Items.back().about->path.front() == met.conflict->path.front();
            const std::size_t object = isSame ? m_Items.back().object : m_Items.size();
            m_Items.push_back({scene, met.conflict, object, met.isOpen, met.decided, met.proposed});
            if (met.proposed) ++m_Proposed;
        }
        m_Open += session.Open().size();
        for (const Problem& problem : session.Problems()) m_Problems.push_back({problem, scene});
    }
}

Conflict SettleDesk::Describe(const Item& item) const {
    return m_Words[item.scene]->Describe(*item.about);
}

std::optional<std::size_t> SettleDesk::NextOpen(std::size_t from) const {
    for (std::size_t i = 1; i <= m_Items.size(); ++i) {
        const std::size_t at = (from + i) % m_Items.size();
        if (m_Items[at].isOpen) return at;
    }
    return {};
}

std::optional<std::size_t> SettleDesk::PreviousOpen(std::size_t from) const {
    for (std::size_t i = 1; i <= m_Items.size(); ++i) {
        const std::size_t at = (from + m_Items.size() - i) % m_Items.size();
        if (m_Items[at].isOpen) return at;
    }
    return {};
}

bool SettleDesk::IsSettled() const {
    return std::ranges::all_of(Scenes(), [](const auto& session) { return session->IsSettled(); });
}

std::vector<std::uint64_t> SettleDesk::LastSteps() const {
    std::vector<std::uint64_t> steps;
    for (const auto& session : Scenes()) steps.push_back(session->LastStep());
    return steps;
}

/// Writes down the scenes that were at other steps.
void SettleDesk::KeepFrom(const std::vector<std::uint64_t>& lastSteps) {
    for (std::size_t scene = 0; scene < Scenes().size(); ++scene)
        if (Scenes()[scene]->LastStep() != lastSteps[scene]) m_Scenes.Keep(*Scenes()[scene]);
}

/// Brings all scenes back to these steps after a failure, which is told anyway: also those that were written
/// down before the one that failed.
void SettleDesk::ReturnTo(const std::vector<std::uint64_t>& lastSteps) {
    for (std::size_t scene = 0; scene < Scenes().size(); ++scene) {
        SettleSession& session = *Scenes()[scene];
        if (session.LastStep() == lastSteps[scene]) continue;
        try {
            while (session.LastStep() > lastSteps[scene] && session.Undo()) {
            }
            while (session.LastStep() < lastSteps[scene] && session.Redo()) {
            }
            m_Scenes.Keep(session);
        } catch (const Failure&) {
        }
    }
    Refresh();
}

/// Makes a step in any scenes, and keeps it; if that fails anywhere it is taken back everywhere.
template <class Make> SettleDesk::Step SettleDesk::MakeStep(const Make& make) {
    const auto decisions = [&] {
        std::size_t count = 0;
        for (const auto& session : Scenes()) count += session->Decisions().size();
        return count;
    };
    const std::size_t openBefore = m_Open, decisionsBefore = decisions();
    const std::vector<std::uint64_t> lastSteps = LastSteps();
    BeginStep(Scenes());
    std::size_t asked = 0;
    try {
        asked = make();
        KeepFrom(lastSteps);
    } catch (...) {
        ReturnTo(lastSteps);
        for (const auto& session : Scenes()) session->ForgetUndone();
        throw;
    }
    Refresh();
    const std::size_t made = decisions() - decisionsBefore;
    return {openBefore > m_Open ? openBefore - m_Open : 0, made > asked ? made - asked : 0};
}

SettleDesk::Step SettleDesk::Take(std::size_t item, Side side) {
    return MakeStep([&] {
        const Item& taken = m_Items[item];
        DecideOrFail(SceneOf(taken), {{DecisionPath(taken.about->path), side}});
        return std::size_t{1};
    });
}

SettleDesk::Step SettleDesk::TakeUnder(std::size_t item, Side side) {
    return MakeStep([&] {
        SettleSession& session = SceneOf(m_Items[item]);
        UnderObject under(session.Names(), m_Items[item].about->path.front());
        return session.TakeAll(side, [&](const OpenConflict& open) { return under.IsMeant(open); });
    });
}

SettleDesk::Step SettleDesk::TakeAll(Side side) {
    return MakeStep([&] {
        std::size_t asked = 0;
        for (const auto& session : Scenes())
            if (!session->IsSettled())
                asked += session->TakeAll(side, [](const OpenConflict&) { return true; });
        return asked;
    });
}

SettleDesk::Step SettleDesk::Accept(std::size_t scene) {
    return MakeStep(
        [&] { return Scenes()[scene]->TakeAll(Side::Ours, [](const OpenConflict&) { return true; }); });
}

SettleDesk::Step SettleDesk::TakeProposed() {
    return MakeStep([&] {
        std::size_t asked = 0;
        for (const auto& session : Scenes())
            if (session->CountProposed())
                asked += session->TakeProposed([](const OpenConflict&) { return true; });
        return asked;
    });
}

SettleDesk::Step SettleDesk::Mend(const SettleProblem& problem, const SettleProblem::Remedy& remedy) {
    return MakeStep([&] {
        DecideOrFail(*Scenes()[problem.scene], remedy.decisions);
        return remedy.decisions.size();
    });
}

bool SettleDesk::GoBack(bool (*step)(Sessions)) {
    const std::vector<std::uint64_t> lastSteps = LastSteps();
    try {
        if (!step(Scenes())) return false;
        KeepFrom(lastSteps);
    } catch (...) {
        ReturnTo(lastSteps);
        throw;
    }
    Refresh();
    return true;
}

bool SettleDesk::Undo() {
    return GoBack(UndoStep);
}

bool SettleDesk::Redo() {
    return GoBack(RedoStep);
}

std::vector<std::string> SettleDesk::Finish(bool overwrite, Remarks& remarks) {
    return m_Scenes.Finish(overwrite, remarks);
}

} // namespace ovrin
