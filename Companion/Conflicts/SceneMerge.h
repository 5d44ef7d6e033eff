#pragma once

#include "Conflicts/OpenMerge.h"

#include "Merge/ConflictType.h"
#include "Session/MergeSession.h"

#include <span>
#include <string>
#include <vector>

namespace ovrin {

/// What happened to both sides where they meet.
enum class ConflictKind {
    BothChanged,       ///< one value, in two ways
    BothAdded,         ///< what the base lacks, in two ways
    TheirsRemoved,     ///< what ours changed
    ParentLoop,        ///< objects were moved below each other
    BrokenRequirement, ///< one side removed what an object of the other needs
    KeyOrder,          ///< the order in which the fields of an object are written
};

/// A conflict of a merge that nothing settles.
struct OpenConflict {
    ovrin_yaml::Path path; ///< what a decision about it names; the record's own
    ConflictKind kind;
    ovrin_yaml::MergeSession::Record record; ///< whose operations stay, whatever else is merged later
};

/// The merge of the three texts of a scene. They are read and compared once, and merged any number of times:
///
///     SceneMerge merge(texts, std::move(rules.rules), std::move(rules.types));
///     merge.Merge({{"734813.MonoBehaviour.m_Brightness", Side::Theirs}});
///     for (const OpenConflict& conflict : merge.Open()) ...
///     Deliver(path, merge.Result())
///
/// All of it throws Failure, worded for people, for texts that can't be merged. It belongs to one thread at a
/// time.
class SceneMerge {
public:
    /// Reads and compares. Where the base is empty both sides added the scene: it stands for an object file
    /// of the same header without objects. `watcher` is told of all steps, of later merges too.
    explicit SceneMerge(ThreeTexts texts, ovrin_yaml::MergeRules rules,
                        ovrin_yaml::YAMLTypeInfoManager types = {},
                        ovrin_yaml::Threads threads = ovrin_yaml::Threads::WhereWorthwhile,
                        ovrin_yaml::StageWatcher* watcher = nullptr);

    bool IsBothAdded() const { return m_IsBothAdded; }

    /// Merges with these decisions in place of earlier ones; of several that match a path the first counts.
    /// `take` is what the result has at open conflicts. A loop of parents that is open is broken in it, so
    /// that the result can be opened whatever is left open.
    void Merge(std::span<const Decision> decisions = {}, Side take = Side::Ours);

    /// The conflicts that no decision settles, by their paths. A requirement that is broken is settled by any
    /// decision about the object; one of parents that go round in a loop only by those that end it.
    const std::vector<OpenConflict>& Open() const { return m_Open; }
    /// Those decisions that match nothing that either side touched.
    const std::vector<Decision>& Unmatched() const { return m_Unmatched; }
    /// Whether the result lacks what an object in it needs, whoever decided so.
    bool HasBrokenDependencies() const { return m_Session.HasBrokenDependencies(); }

    /// The merged scene as its file is written.
    std::string Result() const;

    /// What the merge knows: trees, diffs, records. The base is kept.
    ovrin_yaml::MergeSession& Session() { return m_Session; }

private:
    void RunMerge(const std::vector<ovrin_yaml::RecordResolve>& decisions, Side take);
    void CollectOpen(const ovrin_yaml::ResolveTable& decided);
    void BreakLoops(std::vector<ovrin_yaml::RecordResolve> decisions, Side take);

    const bool m_IsBothAdded;
    ovrin_yaml::StageWatcher* const m_Watcher;
    ovrin_yaml::MergeSession m_Session;
    std::vector<OpenConflict> m_Open;
    std::vector<Decision> m_Unmatched;
};

} // namespace ovrin
