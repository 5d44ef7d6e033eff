#include "Settle/SettleSession.h"

#include "Conflicts/Conflict.h"
#include "Conflicts/DecisionPath.h"
#include "Settle/Consequences.h"
#include "Settle/DecisionTable.h"
#include "Settle/PlainValues.h"

#include <algorithm>
#include <map>
#include <set>
#include <span>
#include <string_view>
#include <utility>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

/// As RecordPlaces wants it.
const MergeSession& MergedOnce(SceneMerge& merge, Side take) {
    MergeHere(merge, {}, take);
    return merge.Session();
}

/// Whether a decision is about something that the path leads through, so that the merge doesn't go on to its
/// end.
bool IsCovered(Path path, const DecisionTable& decided) {
    for (path.pop_back(); !path.empty(); path.pop_back())
        if (decided.Find(path)) return true;
    return false;
}

/// Whether an object that one side lacks is there, or isn't, by a decision already, as it would be by this
/// one: then the side stays that a person took for it.
bool IsSoAlready(const Decision& decision, const DecisionTable& decided, const MergeNames& names) {
    const Path path = PathOfDecision(decision.path);
    const auto isIn = [&](Version version) { return names.Has(version, path.front()); };
    if (path.size() != 1 || isIn(Version::Ours) == isIn(Version::Theirs)) return false;
    const std::optional<Side> side = decided.Find(path);
    return side && isIn(VersionOf(*side)) == isIn(VersionOf(decision.side));
}

/// The objects that a side removed, and that are kept by a decision about a conflict.
std::vector<MergeNames::ID> KeptBy(const DecisionTable& decided, const MetConflicts& conflicts,
                                   const MergeNames& names) {
    std::vector<MergeNames::ID> kept;
    for (std::size_t i = 0; i < conflicts.size(); ++i) {
        const Path& path = conflicts[i].path;
        if (path.size() != 1) continue;
        const std::optional<Side> side = decided.Find(path);
        if (side && names.Has(VersionOf(*side), path.front())) kept.push_back(path.front());
    }
    return kept;
}

} // namespace

SettleSession::SettleSession(OpenMerge merge, Progress progress)
    : m_Source(std::move(merge)), m_Kept(std::move(progress)), m_Merge(SceneMergeOf(m_Source)),
      m_Names(m_Merge.Session()), m_Decisions(m_Kept.decisions), m_Steps(m_Kept.steps),
      m_Places(MergedOnce(m_Merge, m_Source.take), m_Names) {
    Meet();
    if (m_Source.identity.empty()) m_Source.conflicts = Open().size();
    m_Problems = FindProblems(m_Merge, m_Names);
    if (m_Decisions.empty()) return;
    // What later decisions took the place of isn't met any more, but is in the merge without them.
    for (const std::string& path : MergeAgain())
        if (!Touches(path)) m_Idle.push_back(path);
}

/// The conflicts of the merge as it is in this process.
void SettleSession::Meet() {
    m_Conflicts.Add(m_Merge.Open(), m_Names);
    if (m_Earlier) Propose(*m_Earlier);
}

void SettleSession::Propose(const EarlierDecisions& earlier) {
    m_Earlier = &earlier;
    if (earlier.IsEmpty()) return;
    for (std::size_t i = 0; i < m_Conflicts.size(); ++i)
        if (const auto values = EarlierDecisions::Values::Of(m_Conflicts[i], m_Places))
            if (const std::optional<Side> side = earlier.Find(*values)) m_Conflicts.SetProposed(i, *side);
}

std::size_t SettleSession::TellDecided(EarlierDecisions& earlier) const {
    std::size_t told = 0;
    for (std::size_t i = 0; i < m_Conflicts.size(); ++i) {
        const std::optional<Side> decided = m_Conflicts.StateOf(i).decided;
        const auto values = decided ? EarlierDecisions::Values::Of(m_Conflicts[i], m_Places) : std::nullopt;
        if (!values) continue;
        earlier.Add(*values, *decided);
        ++told;
    }
    return told;
}

/// Merges by the decisions. Returns those that match nothing.
std::vector<std::string> SettleSession::MergeAgain() {
    MergedScene merged = MergeApart(m_Merge, m_Names, m_Decisions, m_Source.take);
    const auto isMet = [&](const std::string& path) {
        return m_Conflicts.Find(PathOfDecision(path)).has_value();
    };
    if (!std::ranges::all_of(merged.open, isMet)) {
        // Its operations are wanted, and stay only with a merge in this process. That is rare enough.
        MergeHere(m_Merge, m_Decisions, m_Source.take);
        Meet();
        MergeHere(m_Merge, {}, m_Source.take);
    }
    TakeStates(merged.open);
    m_Problems = std::move(merged.problems);
    return std::move(merged.unmatched);
}

void SettleSession::TakeStates(const std::vector<std::string>& open) {
    const DecisionTable decided(m_Decisions);
    std::vector<MetConflicts::State> states(m_Conflicts.size(), {false, {}});
    for (const std::string& path : open) states[*m_Conflicts.Find(PathOfDecision(path))].isOpen = true;
    for (std::size_t i = 0; i < states.size(); ++i) states[i].decided = decided.Find(m_Conflicts[i].path);
    m_Conflicts.SetStates(std::move(states));
}

/// The conflict that a decision is about, if nothing else follows from it.
std::optional<std::size_t> SettleSession::FindPlain(const Decision& decision) {
    const std::optional<std::size_t> found = m_Conflicts.Find(PathOfDecision(decision.path));
    if (!found) return {};
    const auto [isPlain, isNew] = m_ArePlain.try_emplace(*found, false);
    if (isNew) isPlain->second = IsPlainValue(m_Conflicts[*found], m_Places);
    return isPlain->second ? found : std::nullopt;
}

bool SettleSession::IsAsMerged(MergeNames::ID object) {
    return std::ranges::all_of(m_Decisions, [&](const Decision& decision) {
        const std::optional<std::size_t> at = FindPlain(decision);
        return at && m_Conflicts[*at].path.front() != object;
    });
}

/// Makes what follows from decisions, without merging. False if a merge must tell.
bool SettleSession::DecidePlainly(std::span<const Decision> decisions) {
    std::vector<MetConflicts::State> states = m_Conflicts.States();
    std::optional<DecisionTable> made;
    const auto isCovered = [&](const Path& path) {
        if (!made) made.emplace(m_Decisions);
        return IsCovered(path, *made);
    };
    for (const Decision& decision : decisions) {
        const std::optional<std::size_t> at = FindPlain(decision);
        if (!at || (!states[*at].isOpen && isCovered(m_Conflicts[*at].path))) return false;
        states[*at] = {false, decision.side};
    }
    m_Conflicts.SetStates(std::move(states));
    return true;
}

/// The same for decisions that are taken back, those before them being left.
bool SettleSession::UndoPlainly(std::span<const Decision> decisions) {
    std::vector<MetConflicts::State> states = m_Conflicts.States();
    const DecisionTable decided(m_Decisions);
    for (const Decision& decision : decisions) {
        const std::optional<std::size_t> at = FindPlain(decision);
        if (!at) return false;
        const std::optional<Side> side = decided.Find(m_Conflicts[*at].path);
        states[*at] = {!side, side};
    }
    m_Conflicts.SetStates(std::move(states));
    return true;
}

std::size_t SettleSession::CountProposed() const {
    const std::vector<MetConflict> conflicts = Conflicts();
    return static_cast<std::size_t>(
        std::ranges::count_if(conflicts, [](const MetConflict& met) { return met.proposed.has_value(); }));
}

bool SettleSession::Touches(const std::string& path) {
    const DecisionTable table({{path, Side::Ours}});
    return std::ranges::any_of(
        m_Merge.Session().Resolver().Records(),
        [&](const MergeSession::Record& record) { return table.Find(record.path.Elements()).has_value(); });
}

/// What `step` returns. If it throws, the session is as before.
template <class Step> auto SettleSession::OrBack(const Step& step) {
    const std::vector<Decision> decisions = m_Decisions;
    const std::vector<DecisionStep> steps = m_Steps;
    const std::vector<MetConflicts::State> states = m_Conflicts.States();
    const std::vector<Problem> problems = m_Problems;
    try {
        return step();
    } catch (...) {
        m_Decisions = decisions;
        m_Steps = steps;
        m_Conflicts.SetStates(states);
        m_Problems = problems;
        throw;
    }
}

std::vector<Decision> SettleSession::Decide(const std::vector<Decision>& decisions, Follow follow) {
    return OrBack([&]() -> std::vector<Decision> {
        const std::size_t before = m_Decisions.size();
        const bool isPlain = DecidePlainly(decisions);
        for (const Decision& decision : decisions) {
            m_Decisions.push_back(decision);
            if (follow == Follow::No || isPlain) continue;
            const std::optional<std::size_t> at = m_Conflicts.Find(PathOfDecision(decision.path));
            if (at) AddConsequences({m_Conflicts[*at]}, {decision.side, !m_Conflicts.StateOf(*at).isOpen});
        }
        std::vector<std::string> unmatched = isPlain ? std::vector<std::string>() : MergeAgain();
        if (follow == Follow::Yes && unmatched.empty() && EndLoops(decisions)) unmatched = MergeAgain();
        const std::set<std::string_view> lost(unmatched.begin(), unmatched.end());
        std::vector<Decision> refused;
        for (const Decision& decision : decisions)
            if (lost.contains(decision.path)) refused.push_back(decision);
        if (refused.empty()) {
            EndStep(before);
        } else {
            m_Decisions.resize(before);
            MergeAgain();
        }
        return refused;
    });
}

/// A loop of parents ends where one side is taken for all that it has above each other there. Whoever decides
/// about one object of it means that, unless the same step tells otherwise of the others.
bool SettleSession::EndLoops(const std::vector<Decision>& decisions) {
    const DecisionTable told(decisions);
    const std::size_t before = m_Decisions.size();
    const std::vector<OpenConflict> open = Open();
    for (const Decision& decision : decisions) {
        const std::optional<std::size_t> at = m_Conflicts.Find(PathOfDecision(decision.path));
        if (!at || !m_Conflicts.StateOf(*at).isOpen || m_Conflicts[*at].kind != ConflictKind::ParentLoop)
            continue;
        std::vector<OpenConflict> above =
            LoopsAbove(m_Names, open, m_Conflicts[*at].path.front(), decision.side);
        std::erase_if(above, [&](const OpenConflict& one) { return told.Find(one.path).has_value(); });
        for (const OpenConflict& one : above) m_Decisions.push_back({DecisionPath(one.path), decision.side});
        AddConsequences(above, {decision.side});
    }
    return m_Decisions.size() > before;
}

void SettleSession::AddConsequences(const std::vector<OpenConflict>& conflicts, TakenSide taken) {
    const DecisionTable decided(m_Decisions);
    const std::vector<MergeNames::ID> kept = KeptBy(decided, m_Conflicts, m_Names);
    taken.alreadyKept = kept;
    for (const Decision& more : Consequences(m_Merge, m_Names, Open(), conflicts, taken))
        if (!IsSoAlready(more, decided, m_Names)) m_Decisions.push_back(more);
}

void SettleSession::EndStep(std::size_t decisionsBefore) {
    m_Steps.push_back({m_Decisions.size() - decisionsBefore, m_NextStep ? m_NextStep : LastStep() + 1});
    m_Undone.clear();
}

std::size_t SettleSession::TakeAll(Side side, const std::function<bool(const OpenConflict&)>& isMeant) {
    return TakeEach(
        [&](const MetConflict& met) { return isMeant(*met.conflict) ? std::optional(side) : std::nullopt; });
}

std::size_t SettleSession::TakeProposed(const std::function<bool(const OpenConflict&)>& isMeant) {
    return TakeEach(
        [&](const MetConflict& met) { return isMeant(*met.conflict) ? met.proposed : std::nullopt; });
}

/// Decides the open conflicts of which `choose` has a side, and those of them that follow, as one step.
std::size_t SettleSession::TakeEach(const std::function<std::optional<Side>(const MetConflict&)>& choose) {
    return OrBack([&] {
        std::set<Path> tried;
        const std::size_t before = m_Decisions.size();
        for (;;) {
            std::map<Side, std::vector<OpenConflict>> round;
            const std::size_t decided = m_Decisions.size();
            for (const MetConflict& met : Conflicts()) {
                const std::optional<Side> side = met.isOpen ? choose(met) : std::nullopt;
                if (!side || !tried.insert(met.conflict->path).second) continue;
                round[*side].push_back(*met.conflict);
                m_Decisions.push_back({DecisionPath(met.conflict->path), *side});
            }
            if (round.empty()) break;
            if (DecidePlainly(std::span(m_Decisions).subspan(decided))) continue;
            for (const auto& [side, conflicts] : round) AddConsequences(conflicts, {side});
            MergeAgain();
        }
        // Nothing is no step, save that what both sides added was looked through.
        if (m_Decisions.size() == before && !m_Merge.IsBothAdded()) return std::size_t{0};
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
        if (!UndoPlainly(undone.decisions)) MergeAgain();
        m_Undone.push_back(std::move(undone));
        return true;
    });
}

bool SettleSession::Redo() {
    if (m_Undone.empty()) return false;
    return OrBack([&] {
        const UndoneStep& step = m_Undone.back();
        const bool isPlain = DecidePlainly(step.decisions);
        m_Decisions.insert(m_Decisions.end(), step.decisions.begin(), step.decisions.end());
        m_Steps.push_back({step.decisions.size(), step.number});
        if (!isPlain) MergeAgain();
        m_Undone.pop_back();
        return true;
    });
}

void SettleSession::Keep(OpenMerges& store) {
    Progress progress{m_Decisions, Open().size(), m_Steps};
    store.SetProgress(m_Source, m_Kept, progress);
    m_Kept = std::move(progress);
}

std::string SettleSession::InMerged(const std::function<std::string()>& make) {
    return MergeApartTo(m_Merge, m_Decisions, m_Source.take, make);
}

std::string SettleSession::Result() {
    return InMerged([&] { return m_Merge.Result(); });
}

} // namespace ovrin
