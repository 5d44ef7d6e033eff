#pragma once

#include "Names/MergeNames.h"
#include "Review/ConflictMark.h"
#include "Review/MarkedNode.h"

#include <cstdint>
#include <optional>
#include <span>
#include <unordered_map>
#include <vector>

namespace ovrin {

/// The hierarchy of all versions of a merge together: every object that any of them has stands in it once, in
/// the hierarchy's order. Where versions disagree on what an object stands under, it stands where the merge
/// put it, else where the first of ours, theirs and base has it.
///
/// It is built once, and keeps no more of the merge than ids. For one thread at a time.
class SceneTree {
public:
    using ID = MergeNames::ID;
    using Index = std::uint32_t;

    /// The merge must have been merged; `names` are those of its trees.
    SceneTree(SceneMerge& merge, const MergeNames& names);

    /// What stands under a node comes right behind it, and ends `size` nodes behind it.
    std::span<const MarkedNode> Nodes() const { return m_Nodes; }
    std::optional<Index> Find(ID id) const;
    const MarkCounts& Counts() const { return m_Counts; }

    /// The children of a node, those at the top for nothing. With `touchedOnly` those that are touched or
    /// open, or have such below.
    std::vector<Index> Children(std::optional<Index> parent, bool touchedOnly) const;
    /// The components of a place, which stand right behind it.
    std::span<const MarkedNode> PartsOf(Index place) const;
    /// What a node stands under, from the top.
    std::vector<Index> Way(Index node) const;

    /// Counts the conflicts that are open, in place of those that were.
    void CountOpen(std::span<const ConflictMark> marks);

private:
    void PlaceNodes(SceneMerge& merge, const MergeNames& names);
    void Number();
    void SumBelow();

    std::vector<MarkedNode> m_Nodes;
    std::unordered_map<ID, Index> m_Indexes;
    MarkCounts m_Counts;
};

} // namespace ovrin
