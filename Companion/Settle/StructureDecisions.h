#pragma once

#include "Conflicts/Conflict.h"
#include "Conflicts/OpenMerge.h"
#include "Conflicts/SceneMerge.h"
#include "Names/MergeNames.h"
#include "Names/ObjectBody.h"

#include <array>
#include <map>
#include <set>
#include <span>
#include <tuple>
#include <unordered_map>
#include <unordered_set>
#include <utility>
#include <vector>

namespace ovrin {

/// Collects the decisions that keep or remove objects with all that belongs to them: the GameObject, its
/// components, what stands under it, and the entry in the list that names it. The trees and diffs of a merge
/// say what that is, however it is merged.
///
/// A list is left to the merge where the side whose change would be dropped changed entries of it that
/// nothing was collected about, or alone changed other fields of its owner.
class StructureDecisions {
public:
    using ID = MergeNames::ID;

    /// All must stay. What is among `open` is left to its own decision.
    StructureDecisions(SceneMerge& merge, const MergeNames& names, std::span<const OpenConflict> open);

    /// For a Transform in a loop, at which `side` is taken: the lists of children follow.
    void EndLoop(ID transform, Side side);
    /// The same where another side was taken before, whose lists must not stay.
    void EndLoopAgain(ID transform, Side side);
    /// For objects that `without`, ours or theirs, lacks and the other side has: they are kept, with the
    /// whole of what was removed or added with them.
    void Keep(const std::vector<ID>& ids, Side without);
    /// Tells of such objects that other decisions keep: a list that names them besides those of the next call
    /// of Keep can follow.
    void AlreadyKept(const std::vector<ID>& ids, Side without);
    /// Takes Keep back.
    void Return(const std::vector<ID>& ids, Side without);
    /// For such objects the other way round: they go, with what stands under them.
    void Remove(const std::vector<ID>& ids, Side without);

    /// Whether the object is there in one of ours and theirs, and not in `without`, the other.
    bool IsWithout(ID id, Side without) const;
    /// The highest object of those that were removed or added with this one, which `without` lacks.
    ID TopOf(ID id, Side without);
    /// What was collected since the last call.
    std::vector<Decision> Take() {
        m_WantedEntries.clear();
        return std::exchange(m_Decisions, {});
    }

private:
    ObjectBody Body(Side side, ID id) const;
    ID ParentIn(Side side, ID transform) const;
    ID TransformOf(ID gameObject, Side side) const;
    bool WasInBase(ID id) const { return m_Names.Has(Version::Base, id); }
    void DecideWhole(const std::vector<ID>& ids, Side without, Side wanted);
    std::set<ID> Listed(Side side, ID owner, const ovrin_yaml::YAMLScalar* list) const;
    const std::set<ID>& Changed(Side side, ID owner, const ovrin_yaml::YAMLScalar* list);
    void DecideList(Side changer, Side wanted, ID owner, const ovrin_yaml::YAMLScalar* list, ID entry);
    void DecideEntries(ID top, Side without, Side wanted);
    void DecideBelow(ID top, Side without, Side wanted, bool alsoOthers);
    const ovrin_yaml::YAMLMappingDiff& Diff(Side side) const;
    ovrin_yaml::Path PathOfChange(Side changer, ID owner, const ovrin_yaml::YAMLScalar* list) const;
    const std::vector<ID>& Below(ID id, Side without);

    SceneMerge& m_Merge;
    const MergeNames& m_Names;
    std::unordered_set<ID> m_Open; // objects as a whole
    // What was found, since many objects may have one list or stand above each other; by the side without.
    std::array<std::unordered_map<ID, ID>, 3> m_Tops;
    std::array<std::unordered_map<ID, std::vector<ID>>, 3> m_Below;
    std::array<bool, 3> m_IsBelowKnown = {};
    // Only looked into.
    std::map<std::tuple<Side, ID, const ovrin_yaml::YAMLScalar*>, std::set<ID>> m_Changed;
    std::map<std::tuple<Side, Side, ID, const ovrin_yaml::YAMLScalar*>, std::set<ID>> m_WantedEntries;
    std::vector<Decision> m_Decisions;
};

/// Ours of theirs, and theirs of ours or base.
Side OtherThan(Side side);

} // namespace ovrin
