#pragma once

#include "Merge/RecordingConflictResolver.h"
#include "Support/Diffs.h"

/// Merges as texts: three bodies in, the merged body and the records out.
namespace merges {

using namespace diffs;

/// "Both changes a.b: conflict", the record of each decision in its order. `withMerged` false leaves those
/// out that nobody was asked about.
std::string Records(const RecordingConflictResolver& resolver, bool withMerged = true);

struct MergeInput {
    std::string base, left, right;
    MergeResolve byDefault = ResolveBase;
    std::string decisions = ""; // lines as in a report: "left a.b\nbase c"
};

struct MergeOutput {
    std::string body;    // of the merged mapping, as Show gives it
    std::string records; // one line each
    std::string report;  // with the descriptions of what was no conflict
    bool isPending;
};

MergeOutput Merge(const MergeInput& input);
/// The merged body.
std::string Merged(const std::string& base, const std::string& left, const std::string& right);

} // namespace merges
