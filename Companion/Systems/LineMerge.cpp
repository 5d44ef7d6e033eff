#include "Systems/LineMerge.h"

#include "Systems/Process.h"
#include "Words/Failure.h"

#include <utility>

namespace ovrin {

std::optional<LineMerge> MergeLines(const std::string& base, const std::string& ours,
                                    const std::string& theirs) {
    if (FindProgram("git").empty()) return {};
    ProcessResult merge = RunProcess(
        {"git", "merge-file", "-p", "-L", "ours", "-L", "base", "-L", "theirs", "--", ours, base, theirs});
    constexpr int kMostConflicts = 127; // above that it is a failure
    if (merge.status > kMostConflicts) throw Failure("git can't merge it by lines: " + merge.errors);
    return LineMerge{std::move(merge.output), merge.status};
}

} // namespace ovrin
