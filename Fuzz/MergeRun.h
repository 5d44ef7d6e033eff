#pragma once

#include "Diff/MergeRules.h"
#include "Values/OvrinObjects.h"

#include <array>
#include <functional>
#include <memory>
#include <string>

namespace ovrin_fuzz {

/// The three files of a merge. The result is built in the base.
struct MergeFiles {
    ovrin_yaml::OvrinObjects base, left, right;
};

/// All that a merge gives.
struct MergeOutcome {
    std::string failure;    // "none", or what was thrown
    std::string brokenTree; // the first fault of CheckTree, and after which stage; empty if there was none
    std::string report;     // with the decisions that were no conflicts
    std::string result;
    std::array<std::string, 2> premerged; // with blanks and with the right side's values at conflicts
    std::shared_ptr<MergeFiles> files;    // as they are at the end
};

/// Where the premerged files begin.
enum class PremergeFrom {
    Clone,  // the base as it was copied before the merge, with the sides that the merge used
    Reading // files that are read once more for each
};

struct MergeWay {
    std::function<void(MergeFiles&)> read; // reads the three files
    PremergeFrom from = PremergeFrom::Clone;
    bool onThreads = false; // the diffs are made on two threads
    ovrin_yaml::MergeRules rules = {};
};

/// Takes a merge all the way to the result and two premerged files. All trees and diffs are checked after
/// each stage.
MergeOutcome RunMerge(const MergeWay& way);

/// What the second of two outcomes of the same merge has different, or an empty text.
std::string CompareOutcomes(const MergeOutcome& expected, const MergeOutcome& actual);

} // namespace ovrin_fuzz
