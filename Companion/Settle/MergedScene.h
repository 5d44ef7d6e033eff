#pragma once

#include "Conflicts/OpenMerge.h"
#include "Conflicts/SceneMerge.h"
#include "Names/MergeNames.h"
#include "Settle/Problems.h"

#include <functional>
#include <string>
#include <vector>

namespace ovrin {

/// The merge of these texts, by the rules that they are to be merged by; not merged yet.
SceneMerge SceneMergeOf(const OpenMerge& merge);

/// What a merge by certain decisions came to, as a text can hold it.
struct MergedScene {
    std::vector<std::string> open; ///< paths of the conflicts that nothing settles, as decisions name them
    std::vector<std::string> unmatched; ///< paths of decisions that match nothing
    std::vector<Problem> problems;
};

/// Merges a scene by decisions, in a process of its own, which is a copy of this one: what the engine takes
/// of memory for a merge goes with it, so that a scene can be merged after each of thousands of decisions,
/// and `merge` stays as it was. `take` is as in SceneMerge::Merge; the last of several decisions counts.
///
/// Throws Failure for what can't be merged, and where no process can be started or it comes to an end. Only
/// for a process without other threads.
MergedScene MergeApart(SceneMerge& merge, const MergeNames& names, const std::vector<Decision>& decisions,
                       Side take);
/// The same for what `make` returns there, where `merge` is merged by the decisions. What it throws besides
/// Failure counts as the end of the process.
std::string MergeApartTo(SceneMerge& merge, const std::vector<Decision>& decisions, Side take,
                         const std::function<std::string()>& make);

/// The same in this process.
void MergeHere(SceneMerge& merge, const std::vector<Decision>& decisions, Side take);

} // namespace ovrin
