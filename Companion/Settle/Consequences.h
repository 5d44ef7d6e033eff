#pragma once

#include "Conflicts/OpenMerge.h"
#include "Conflicts/SceneMerge.h"
#include "Names/MergeNames.h"

#include <span>
#include <vector>

namespace ovrin {

/// A side that is taken for conflicts.
struct TakenSide {
    Side side;
    bool wereSettled = false; ///< the conflicts, in another way
    /// Objects that other decisions keep, although a side removed them: those that were named with them in
    /// one list follow as if all were kept at once.
    std::span<const MergeNames::ID> alreadyKept = {};
};

/// What follows when `side` is taken for these conflicts: decisions without which the scene would lack what
/// it refers to, or the other way round.
///
///     an object is kept            so are the parts of the removal that it belongs to: the GameObject, its
///     that a side removed          components, all that stands under it, and the entry in the owner's list
///     one that is needed goes      so does what the other side added that needs it
///     a loop of parents is ended   the lists of children follow
///
/// Of conflicts that were settled before, by another side, what followed from that is taken back.
/// What is among `open` is left to its own decision; Settle/StructureDecisions.h tells the limits.
std::vector<Decision> Consequences(SceneMerge& merge, const MergeNames& names,
                                   std::span<const OpenConflict> open,
                                   std::span<const OpenConflict> conflicts, TakenSide taken);

/// Those of the `open` loops of parents that are about what an object stands below on a side: where the side
/// is taken for the object, and for them, too, its way up is the side's, and the loop is ended.
std::vector<OpenConflict> LoopsAbove(const MergeNames& names, std::span<const OpenConflict> open,
                                     MergeNames::ID transform, Side side);

} // namespace ovrin
