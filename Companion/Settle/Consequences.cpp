#include "Settle/Consequences.h"

#include "Conflicts/Requirements.h"
#include "Settle/StructureDecisions.h"

namespace ovrin {

std::vector<Decision> Consequences(SceneMerge& merge, const MergeNames& names,
                                   std::span<const OpenConflict> open,
                                   std::span<const OpenConflict> conflicts, Side side) {
    StructureDecisions structure(merge, names, open);
    for (const OpenConflict& conflict : conflicts)
        if (conflict.kind == ConflictKind::ParentLoop) structure.EndLoop(conflict.path.front(), side);
    for (const Side without : {Side::Ours, Side::Theirs}) {
        std::vector<MergeNames::ID> kept, removed;
        for (const OpenConflict& conflict : conflicts) {
            const MergeNames::ID id = conflict.path.front();
            if (conflict.path.size() != 1 || !structure.IsWithout(id, without)) continue;
            if (names.Has(VersionOf(side), id)) kept.push_back(id);
            if (conflict.kind != ConflictKind::BrokenRequirement || names.Has(VersionOf(side), id)) continue;
            for (const MergeNames::ID needing : NeededBy(merge.Session(), id, side))
                if (structure.IsWithout(needing, without)) removed.push_back(needing);
        }
        structure.Keep(kept, without);
        structure.Remove(removed, without);
    }
    return structure.Take();
}

} // namespace ovrin
