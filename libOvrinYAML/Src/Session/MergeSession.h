#pragma once

#include "Diff/MergeRules.h"
#include "Merge/RecordingConflictResolver.h"
#include "Repair/ObjectAccess.h"
#include "Repair/YAMLTypeInfo.h"
#include "Session/MergeError.h"
#include "Session/ReadInputs.h"
#include "Session/Tasks.h"
#include "Values/OvrinObjects.h"

#include <array>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace ovrin_yaml {

class YAMLMappingDiff;

/// The road of a merge, stage by stage:
///
///     Read  Prepare  Diff                     once
///     Decide  Merge  Apply  Repair            any number of times, with other decisions
///     Premerge                                whenever the base is kept
///
/// so that to decide again reads and diffs nothing again. Three texts become one with
///
///     MergeSession session;
///     session.Read({TextInput("base", base), TextInput("left", left), TextInput("right", right)});
///     session.Prepare();
///     session.Diff();
///     session.Merge();
///     session.Apply();
///     session.Repair();
///     for (const auto* conflict : session.PendingConflicts()) std::cout << PathToString(conflict->path);
///     Output(session.Result(), std::cout);
///
/// Decide, wherever it stands ahead of Merge, is for those who have decisions. A session of two files, base
/// and left, goes as far as Diff.
///
/// Every stage throws MergeError for what is wrong with the files, and std::bad_alloc where there is no
/// memory. After a failure of Read, Prepare or Diff the session can only go; after one of a merge it may be
/// merged again, with other decisions. It belongs to one thread at a time, Premerge aside, and must outlive
/// all that it gives away. What a merge takes of memory for decisions and changed objects stays until the
/// process ends.
class MergeSession {
public:
    using Record = RecordingConflictResolver::Record;

    /// What becomes of the base in Apply.
    enum class Base {
        Kept,  ///< the result is a copy of it, which shares what isn't changed
        UsedUp ///< the result is built in it: nothing can be merged afterwards
    };

    explicit MergeSession(Threads threads = Threads::WhereWorthwhile)
        : m_Threads(threads), m_Run(RunnerFor(threads)) {}
    MergeSession(const MergeSession&) = delete;
    MergeSession& operator=(const MergeSession&) = delete;

    /// What is known of the format of the files; wherever it stands ahead of Diff, best ahead of Read.
    void SetRules(MergeRules rules, YAMLTypeInfoManager types = {});
    const MergeRules& Rules() const { return m_Rules; }
    const YAMLTypeInfoManager& Types() const { return m_Types; }

    /// Reads base, left and, unless it is a session of two, right.
    void Read(const std::vector<InputFile>& files, StageWatcher* watcher = nullptr,
              ReaderOptions options = DefaultReaderOptions());
    /// Transitions with repeated keys become lists; an id that both sides gave to different objects is
    /// changed on the right.
    void Prepare();
    /// What makes the base left and right, each on a thread of its own.
    void Diff(StageWatcher* watcher = nullptr);

    /// The decisions that the next merge goes by, in place of earlier ones, and what an open conflict without
    /// one falls back to.
    void Decide(std::vector<RecordResolve> decisions, MergeResolve byDefault = ResolveBase);
    /// Decides every place that a side changed. From here on the conflicts are known.
    void Merge();
    /// Builds the result. Afterwards the one of an earlier merge is gone.
    void Apply(Base base = Base::Kept);
    /// Repairs the result as an object graph, which may add conflicts.
    void Repair();

    /// A merge beside this one, without decisions: a result of its own in which open conflicts have what
    /// `resolve` says. The base must be kept, and Apply called before; then any number of threads may call
    /// this at the same time.
    std::unique_ptr<OvrinObjects> Premerge(MergeResolve resolve);

    /// The trees, from Read on; the base is as it was unless it is used up.
    OvrinObjects& BaseObjects() { return m_Base; }
    OvrinObjects& LeftObjects() { return m_Left; }
    OvrinObjects& RightObjects() { return m_Right; }
    /// From Diff on.
    const YAMLMappingDiff& LeftDiff() const { return *m_LeftDiff; }
    const YAMLMappingDiff& RightDiff() const { return *m_RightDiff; }
    /// From Merge on.
    const YAMLMappingDiff& MergedDiff() const { return *m_MergedDiff; }
    const RecordingConflictResolver& Resolver() const { return *m_Resolver; }
    /// The records that are conflicts still, in the order of their paths. Complete after Repair; valid until
    /// the next merge.
    std::vector<const Record*> PendingConflicts() const;
    /// From Apply on.
    const OvrinObjects& Result() const { return *m_Result; }
    /// Whether Repair found component dependencies broken.
    bool HasBrokenDependencies() const { return m_HasBrokenDependencies; }

private:
    bool HasRight() const { return m_Names.size() > 2; }
    void DiffOnThreads(StageWatcher* watcher);
    RepairRoots RootsOf(OvrinObjects& merged) const;

    const Threads m_Threads;
    const TaskRunner m_Run;
    MergeRules m_Rules;
    YAMLTypeInfoManager m_Types;
    std::vector<std::string> m_Names; // of base, left and right
    bool m_AreSmall = false;          // as far as is known: threads may cost more than they bring
    OvrinObjects m_Base, m_Left, m_Right;
    const YAMLMappingDiff* m_LeftDiff = nullptr;
    const YAMLMappingDiff* m_RightDiff = nullptr;

    std::vector<RecordResolve> m_Decisions;
    MergeResolve m_ByDefault = ResolveBase;
    std::optional<RecordingConflictResolver> m_Resolver; // of the last merge
    const YAMLMappingDiff* m_MergedDiff = nullptr;
    std::unique_ptr<OvrinObjects> m_Copy; // of the base, for the result
    OvrinObjects* m_Result = nullptr;
    bool m_HasBrokenDependencies = false;
};

} // namespace ovrin_yaml
