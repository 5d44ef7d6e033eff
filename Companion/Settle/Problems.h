#pragma once

#include "Conflicts/OpenMerge.h"
#include "Conflicts/SceneMerge.h"
#include "Names/MergeNames.h"

#include <cstddef>
#include <string>
#include <vector>

namespace ovrin {

/// Decisions that mend something.
struct Remedy {
    std::string text; ///< "keep Harbour/Lantern, too"
    std::vector<Decision> decisions;
};

/// What is wrong with a merged scene although no version had it, so that the sides together or decisions
/// brought it.
struct Problem {
    std::string text; ///< a sentence without a full stop
    std::vector<Remedy> remedies;
};

/// Looks for them where a side or a decision changed something:
///
///     an object stays, and what it belongs to or stood under is gone
///     a value refers to an object that is gone
///     an object isn't in the list of components or children that should name it, or is in one that shouldn't
///     objects stand below each other
///     a component is gone, and another one needs it
///
/// `merge` is merged by the decisions. What an open conflict is about is left to that. At most `most` are
/// told, the others by their number.
std::vector<Problem> FindProblems(SceneMerge& merge, const MergeNames& names, std::size_t most = 200);

} // namespace ovrin
