#include "Settle/Consequences.h"

#include "Conflicts/Conflict.h"
#include "Conflicts/Requirements.h"
#include "Settle/StructureDecisions.h"

#include <algorithm>
#include <iterator>
#include <unordered_set>

namespace ovrin {

std::vector<Decision> Consequences(SceneMerge& merge, const MergeNames& names,
                                   std::span<const OpenConflict> open,
                                   std::span<const OpenConflict> conflicts, TakenSide taken) {
    const Side side = taken.side;
    StructureDecisions structure(merge, names, open);
    for (const OpenConflict& conflict : conflicts)
        if (conflict.kind == ConflictKind::ParentLoop)
            taken.wereSettled ? structure.EndLoopAgain(conflict.path.front(), side)
                              : structure.EndLoop(conflict.path.front(), side);
    for (const Side without : {Side::Ours, Side::Theirs}) {
        std::vector<MergeNames::ID> kept, given, removed;
        for (const OpenConflict& conflict : conflicts) {
            const MergeNames::ID id = conflict.path.front();
            if (conflict.path.size() != 1 || !structure.IsWithout(id, without)) continue;
            const bool isKept = names.Has(VersionOf(side), id);
            (isKept ? kept : given).push_back(id);
            if (conflict.kind != ConflictKind::BrokenRequirement || (isKept && !taken.wereSettled)) continue;
            for (const MergeNames::ID needing : NeededBy(merge.Session(), id, isKept ? without : side))
                if (structure.IsWithout(needing, without)) (isKept ? kept : removed).push_back(needing);
        }
        std::vector<MergeNames::ID> before;
        std::ranges::copy_if(taken.alreadyKept, std::back_inserter(before),
                             [&](MergeNames::ID id) { return structure.IsWithout(id, without); });
        structure.AlreadyKept(before, without);
        structure.Keep(kept, without);
        if (taken.wereSettled) structure.Return(given, without);
        structure.Remove(removed, without);
    }
    return structure.Take();
}

std::vector<OpenConflict> LoopsAbove(const MergeNames& names, std::span<const OpenConflict> open,
                                     MergeNames::ID transform, Side side) {
    const Hierarchy& places = names.In(VersionOf(side)).Places();
    std::unordered_set<MergeNames::ID> above;
    const auto fatherOf = [&](MergeNames::ID id) {
        return LocalReference(places.Body(id).Field(ovrin_yaml::YAMLScalar::mFather));
    };
    for (MergeNames::ID id = fatherOf(transform); id && id != transform && above.insert(id).second;)
        id = fatherOf(id);
    std::vector<OpenConflict> found;
    for (const OpenConflict& conflict : open)
        if (conflict.kind == ConflictKind::ParentLoop && above.contains(conflict.path.front()))
            found.push_back(conflict);
    return found;
}

} // namespace ovrin
