#pragma once

#include "Conflicts/OpenMerge.h"
#include "Conflicts/OpenMerges.h"
#include "Conflicts/SceneMerge.h"
#include "Names/MergeNames.h"
#include "Names/RecordPlace.h"
#include "Settle/Consequences.h"
#include "Settle/EarlierDecisions.h"
#include "Settle/MergedScene.h"
#include "Settle/MetConflicts.h"

#include <cstddef>
#include <cstdint>
#include <functional>
#include <map>
#include <optional>
#include <span>
#include <string>
#include <vector>

namespace ovrin {

/// A scene's open merge while a person settles it: the three texts, all conflicts that were met, the
/// decisions so far, and what follows from them. It is what every way to settle is built on, and keeps
/// nothing on the disk by itself:
///
///     SettleSession session(merge, store.ProgressOf(merge));
///     session.Decide({{"734813.MonoBehaviour.m_Brightness", Side::Theirs}});
///     session.Keep(store);
///
/// After each step the scene is merged again (Settle/MergedScene.h), unless nothing can follow from its
/// decisions (Settle/PlainValues.h); it is read and compared once. A later decision counts more than an
/// earlier one. All functions throw Failure, worded for people, for texts that
/// can't be merged, and leave the session as it was then. Only for a process without other threads.
class SettleSession {
public:
    /// `merge` comes with its texts.
    explicit SettleSession(OpenMerge merge, Progress progress = {});

    const OpenMerge& Source() const { return m_Source; }
    const std::vector<Decision>& Decisions() const { return m_Decisions; }
    /// Nothing is open, and a scene that both sides added was looked through, which a step shows.
    bool IsSettled() const { return Open().empty() && !(m_Merge.IsBothAdded() && m_Steps.empty()); }
    /// The paths of those decisions it began with that match nothing in the merge, and have no effect.
    const std::vector<std::string>& Idle() const { return m_Idle; }
    /// What is wrong with the result.
    const std::vector<Problem>& Problems() const { return m_Problems; }

    using Met = MetConflict;
    /// The conflicts of the merge as it began and those that decisions led to, in the order of the hierarchy.
    std::vector<Met> Conflicts() const { return m_Conflicts.InOrder(); }
    std::size_t CountMet() const { return m_Conflicts.size(); }
    const std::vector<OpenConflict>& Open() const { return m_Conflicts.Open(); }
    /// How many open ones something is proposed of.
    std::size_t CountProposed() const;
    /// Whether a path or pattern matches anything that either side changed.
    bool Touches(const std::string& path);

    /// Whether what follows from decisions about conflicts (Settle/Consequences.h) is decided with them.
    enum class Follow { No, Yes };
    /// Makes these decisions, as one step. Returns those that match nothing; if there are any, nothing is
    /// decided.
    std::vector<Decision> Decide(const std::vector<Decision>& decisions, Follow follow = Follow::Yes);
    /// Decides all open conflicts that `isMeant` accepts, and those of them that follow, for a side, as one
    /// step. What can't be settled by a side stays open. Returns how many conflicts were settled. Where none
    /// is meant there is no step, save in a scene that both sides added.
    std::size_t TakeAll(Side side, const std::function<bool(const OpenConflict&)>& isMeant);
    /// The same by what is proposed of each.
    std::size_t TakeProposed(const std::function<bool(const OpenConflict&)>& isMeant);
    /// Takes the last step back. False if there is none.
    bool Undo();
    /// Makes the step again that was taken back last, unless another was made since. False if there is none.
    bool Redo();

    /// The number of the last step, and of the one that Redo would make; 0 where there is none. Steps count
    /// up from 1, unless a number is given for those that follow, not less than the last: the scenes that are
    /// settled together share one row of steps (Settle/Steps.h).
    std::uint64_t LastStep() const { return m_Steps.empty() ? 0 : m_Steps.back().number; }
    std::uint64_t NextUndone() const { return m_Undone.empty() ? 0 : m_Undone.back().number; }
    void NumberSteps(std::uint64_t number) { m_NextStep = number; }
    /// Redo has nothing left to make.
    void ForgetUndone() { m_Undone.clear(); }

    /// Looks up what was decided before of conflicts with the same values, and of those that will be met.
    /// `earlier` must stay.
    void Propose(const EarlierDecisions& earlier);
    /// Adds what is decided of conflicts here. Returns of how many.
    std::size_t TellDecided(EarlierDecisions& earlier) const;

    /// Writes the decisions down, and the merge itself if nobody has. Throws Failure where it
    /// IsKeptElsewhere.
    void Keep(OpenMerges& store);
    /// Whether another process made the merge again, ended it or decided in it since the decisions were read
    /// or written down here.
    bool IsKeptElsewhere(const OpenMerges& store) const { return !store.IsStill(m_Source, m_Kept); }

    /// Whether an object is in the result as Merge() has it: every decision so far is about one value of
    /// another object, and changes nothing else. False where only a merge could tell.
    bool IsAsMerged(MergeNames::ID object);

    /// What `make` returns in a process of its own, where Merge() is merged by the decisions
    /// (Settle/MergedScene.h).
    std::string InMerged(const std::function<std::string()>& make);
    /// The scene as it is merged by the decisions.
    std::string Result();
    /// The scene as the merge left it before anything was decided.
    std::string Left() const { return m_Merge.Result(); }
    /// The merge without decisions: trees and diffs of the three versions.
    SceneMerge& Merge() { return m_Merge; }
    const MergeNames& Names() const { return m_Names; }

private:
    bool EndLoops(const std::vector<Decision>& decisions);
    void AddConsequences(const std::vector<OpenConflict>& conflicts, TakenSide taken);
    void EndStep(std::size_t decisionsBefore);
    void Meet();
    std::size_t TakeEach(const std::function<std::optional<Side>(const MetConflict&)>& choose);
    std::vector<std::string> MergeAgain();
    void TakeStates(const std::vector<std::string>& open);
    std::optional<std::size_t> FindPlain(const Decision& decision);
    bool DecidePlainly(std::span<const Decision> decisions);
    bool UndoPlainly(std::span<const Decision> decisions);
    template <class Step> auto OrBack(const Step& step);

    OpenMerge m_Source;
    Progress m_Kept; // as it is written down
    SceneMerge m_Merge;
    MergeNames m_Names;
    std::vector<Decision> m_Decisions;
    std::vector<std::string> m_Idle;
    std::vector<DecisionStep> m_Steps;
    struct UndoneStep {
        std::vector<Decision> decisions;
        std::uint64_t number;
    };
    std::vector<UndoneStep> m_Undone; // the one that was taken back last at the end
    std::uint64_t m_NextStep = 0;     // its number; 0 for the one behind the last
    RecordPlaces m_Places;
    const EarlierDecisions* m_Earlier = nullptr;
    MetConflicts m_Conflicts;
    std::map<std::size_t, bool> m_ArePlain; // those conflicts of which it was asked, by their indexes
    std::vector<Problem> m_Problems;
};

} // namespace ovrin
