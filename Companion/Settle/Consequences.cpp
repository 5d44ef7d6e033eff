#include "Settle/Consequences.h"

#include "Conflicts/Requirements.h"
#include "Settle/StructureDecisions.h"

namespace ovrin {

std::vector<Decision> Consequences(SceneMerge& merge, const MergeNames& names,
                                   std::span<const OpenConflict> open,
                                   std::span<const OpenConflict> conflicts, Side side, bool wereSettled) {
    StructureDecisions structure(merge, names, open);
    for (const OpenConflict& conflict : conflicts)
        if (conflict.kind == ConflictKind::ParentLoop)
            wereSettled ? structure.EndLoopAgain(conflict.path.front(), side)
                        : structure.EndLoop(conflict.path.front(), side);
    for (const Side without : {Side::Ours, Side::Theirs}) {
        std::vector<MergeNames::ID> kept, given, removed;
        for (const OpenConflict& conflict : conflicts) {
            const MergeNames::ID id = conflict.path.front();
            if (conflict.path.size() != 1 || !structure.IsWithout(id, without)) continue;
            (names.Has(VersionOf(side), id) ? kept : given).push_back(id);
            if (conflict.kind != ConflictKind::BrokenRequirement || names.Has(VersionOf(side), id)) continue;
            for (const MergeNames::ID needing : NeededBy(merge.Session(), id, side))
                if (structure.IsWithout(needing, without)) removed.push_back(needing);
        }
        structure.Keep(kept, without);
        if (wereSettled) structure.Return(given, without);
        structure.Remove(removed, without);
    }
    return structure.Take();
}

} // namespace ovrin
