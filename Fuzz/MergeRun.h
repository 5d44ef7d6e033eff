#pragma once

#include "Session/MergeSession.h"

#include <array>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace ovrin_fuzz {

/// All that a merge gives.
struct MergeOutcome {
    std::string failure;    // "none", or what was thrown and its place
    std::string brokenTree; // the first fault of CheckTree, and after which stage; empty if there was none
    std::string report;     // with the decisions that were no conflicts
    std::string result;
    std::array<std::string, 2> premerged; // with blanks and with the right side's values at conflicts
    std::shared_ptr<ovrin_yaml::MergeSession> session; // of the result
};

/// Which sessions give the result and the premerged files.
enum class Sessions {
    One,    // merged again and again, with its base kept
    OneEach // each with files that are read once more, and with its base used up
};

struct MergeWay {
    std::function<std::vector<ovrin_yaml::InputFile>()> files;
    ovrin_yaml::ReaderOptions options;
    ovrin_yaml::Threads threads = ovrin_yaml::Threads::None;
    Sessions sessions = Sessions::One;
    ovrin_yaml::MergeRules rules = {};
    /// Looking at a tree builds what is unbuilt.
    bool checksStages = true;
};

/// Takes a merge all the way to the result and two premerged files. All trees and diffs are checked after
/// each stage, or all trees at the end.
MergeOutcome RunMerge(const MergeWay& way);

/// What the second of two outcomes of the same merge has different, or an empty text.
std::string CompareOutcomes(const MergeOutcome& expected, const MergeOutcome& actual);

} // namespace ovrin_fuzz
