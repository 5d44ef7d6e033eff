#include "Settle/SettleSession.h"

#include "Conflicts/DecisionPath.h"
#include "Conflicts/OpenMerges.h"
#include "Scenes/SceneRules.h"
#include "Settle/Consequences.h"

#include <algorithm>
#include <set>
#include <utility>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

SceneMerge MergeOf(const OpenMerge& merge) {
    FormatFiles files;
    if (!merge.rules.empty()) files.rules = merge.rules;
    if (!merge.typeInfo.empty()) files.typeInfo = merge.typeInfo;
    SceneRules rules = ReadSceneRules(files);
    return SceneMerge(merge.texts, std::move(rules.rules), std::move(rules.types));
}

/// The sides of `decisions` as a table of which the last one that matches counts.
ResolveTable TableOf(const std::vector<Decision>& decisions) {
    constexpr MergeResolve kResolves[] = {ResolveBase, ResolveRight, ResolveLeft};
    std::vector<RecordResolve> resolves;
    for (auto decision = decisions.rbegin(); decision != decisions.rend(); ++decision)
        resolves.push_back(
            {PathOfDecision(decision->path), kResolves[static_cast<std::size_t>(decision->side)]});
    ResolveTable table;
    table.Set(resolves);
    return table;
}

std::optional<Side> SideOf(std::optional<MergeResolve> resolve) {
    if (!resolve) return {};
    return *resolve == ResolveBase ? Side::Base : *resolve == ResolveRight ? Side::Ours : Side::Theirs;
}

} // namespace

SettleSession::SettleSession(OpenMerge merge, Progress progress)
    : m_Source(std::move(merge)), m_Merge(MergeOf(m_Source)), m_Names(m_Merge.Session()),
      m_Decisions(std::move(progress.decisions)), m_Steps(std::move(progress.steps)) {
    MergeHere(m_Merge, {}, m_Source.take);
    Meet(m_Merge.Open());
    m_Open = m_Merge.Open();
    if (m_Source.identity.empty()) m_Source.conflicts = Open().size();
    if (!m_Decisions.empty()) MergeBy(m_Decisions);
}

void SettleSession::Meet(const std::vector<OpenConflict>& conflicts) {
    for (const OpenConflict& conflict : conflicts)
        m_Conflicts.try_emplace(DecisionPath(conflict.path), conflict);
}

void SettleSession::MergeBy(const std::vector<Decision>& decisions) {
    MergedScene merged = MergeApart(m_Merge, m_Names, decisions, m_Source.take);
    const auto isMet = [&](const std::string& path) { return m_Conflicts.contains(path); };
    if (!std::ranges::all_of(merged.open, isMet)) {
        // Its operations are wanted, and stay only with a merge in this process. That is rare enough.
        MergeHere(m_Merge, decisions, m_Source.take);
        Meet(m_Merge.Open());
        MergeHere(m_Merge, {}, m_Source.take);
    }
    std::vector<OpenConflict> open;
    open.reserve(merged.open.size());
    for (const std::string& path : merged.open) open.push_back(m_Conflicts.at(path));
    m_Open = std::move(open);
    m_Merged = std::move(merged);
}

std::vector<SettleSession::Met> SettleSession::Conflicts() const {
    std::set<Path> open;
    for (const OpenConflict& conflict : Open()) open.insert(conflict.path);
    const ResolveTable decided = TableOf(m_Decisions);
    std::vector<MergeNames::ID> ids;
    for (const auto& [path, conflict] : m_Conflicts) ids.push_back(conflict.path.front());
    const std::vector<std::uint32_t> ranks = m_Names.Ranks(ids);
    std::vector<std::pair<std::uint32_t, Met>> ranked;
    for (const auto& [path, conflict] : m_Conflicts) {
        const bool isOpen = open.contains(conflict.path);
        const auto side = isOpen ? std::nullopt : SideOf(decided.Find(conflict.path));
        ranked.push_back({ranks[ranked.size()], {&conflict, isOpen, side}});
    }
    std::ranges::stable_sort(ranked, {}, &std::pair<std::uint32_t, Met>::first);
    std::vector<Met> conflicts;
    conflicts.reserve(ranked.size());
    for (auto& [rank, conflict] : ranked) conflicts.push_back(std::move(conflict));
    return conflicts;
}

bool SettleSession::Touches(const std::string& path) {
    const ResolveTable table = TableOf({{path, Side::Ours}});
    return std::ranges::any_of(
        m_Merge.Session().Resolver().Records(),
        [&](const MergeSession::Record& record) { return table.Find(record.path.Elements()).has_value(); });
}

/// What `step` returns. If it throws, the session is as before.
template <class Step> auto SettleSession::OrBack(const Step& step) {
    const std::vector<Decision> decisions = m_Decisions;
    const std::vector<DecisionStep> steps = m_Steps;
    const MergedScene merged = m_Merged;
    const std::vector<OpenConflict> open = m_Open;
    try {
        return step();
    } catch (...) {
        m_Decisions = decisions;
        m_Steps = steps;
        m_Merged = merged;
        m_Open = open;
        throw;
    }
}

std::vector<Decision> SettleSession::Decide(const std::vector<Decision>& decisions, Follow follow) {
    return OrBack([&] {
        const std::size_t before = m_Decisions.size();
        for (const Decision& decision : decisions) {
            m_Decisions.push_back(decision);
            const Path path = PathOfDecision(decision.path);
            const auto open = std::ranges::find(Open(), path, &OpenConflict::path);
            if (follow == Follow::Yes && open != Open().end()) AddConsequences({*open}, decision.side);
        }
        MergeBy(m_Decisions);
        std::vector<Decision> unmatched;
        for (const Decision& decision : decisions)
            if (std::ranges::find(m_Merged.unmatched, decision.path) != m_Merged.unmatched.end())
                unmatched.push_back(decision);
        if (unmatched.empty()) {
            EndStep(before);
        } else {
            m_Decisions.resize(before);
            MergeBy(m_Decisions);
        }
        return unmatched;
    });
}

void SettleSession::AddConsequences(const std::vector<OpenConflict>& conflicts, Side side) {
    const std::vector<Decision> more = Consequences(m_Merge, m_Names, m_Open, conflicts, side);
    m_Decisions.insert(m_Decisions.end(), more.begin(), more.end());
}

void SettleSession::EndStep(std::size_t decisionsBefore) {
    m_Steps.push_back({m_Decisions.size() - decisionsBefore, m_NextStep ? m_NextStep : LastStep() + 1});
    m_Undone.clear();
}

std::size_t SettleSession::TakeAll(Side side, const std::function<bool(const OpenConflict&)>& isMeant) {
    return OrBack([&] {
        std::set<Path> tried;
        const std::size_t before = m_Decisions.size();
        for (;;) {
            std::vector<OpenConflict> round;
            for (const OpenConflict& conflict : Open())
                if (isMeant(conflict) && tried.insert(conflict.path).second) round.push_back(conflict);
            if (round.empty()) break;
            for (const OpenConflict& conflict : round)
                m_Decisions.push_back({DecisionPath(conflict.path), side});
            AddConsequences(round, side);
            MergeBy(m_Decisions);
        }
        EndStep(before);
        std::size_t settled = tried.size();
        for (const OpenConflict& conflict : Open()) settled -= tried.count(conflict.path);
        return settled;
    });
}

bool SettleSession::Undo() {
    if (m_Steps.empty()) return false;
    return OrBack([&] {
        const DecisionStep step = m_Steps.back();
        const auto begin = m_Decisions.end() - static_cast<std::ptrdiff_t>(step.decisions);
        UndoneStep undone{{begin, m_Decisions.end()}, step.number};
        m_Decisions.erase(begin, m_Decisions.end());
        m_Steps.pop_back();
        MergeBy(m_Decisions);
        m_Undone.push_back(std::move(undone));
        return true;
    });
}

bool SettleSession::Redo() {
    if (m_Undone.empty()) return false;
    return OrBack([&] {
        const UndoneStep& step = m_Undone.back();
        m_Decisions.insert(m_Decisions.end(), step.decisions.begin(), step.decisions.end());
        m_Steps.push_back({step.decisions.size(), step.number});
        MergeBy(m_Decisions);
        m_Undone.pop_back();
        return true;
    });
}

void SettleSession::Keep(OpenMerges& store) {
    if (m_Source.identity.empty()) store.Add(m_Source);
    store.SetProgress(m_Source, {m_Decisions, Open().size(), m_Steps});
}

std::string SettleSession::InMerged(const std::function<std::string()>& make) {
    return MergeApartTo(m_Merge, m_Decisions, m_Source.take, make);
}

std::string SettleSession::Result() {
    return InMerged([&] { return m_Merge.Result(); });
}

} // namespace ovrin
