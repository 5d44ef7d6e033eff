#include "Support/Merges.h"
#include "Merge/DiffMerge.h"

#include "Diff/CheckDiff.h"
#include "Merge/ConflictReport.h"
#include "Writing/CheckTree.h"

#include <sstream>

namespace merges {

std::string Records(const RecordingConflictResolver& resolver, bool withMerged) {
    static const char* const kResolves[] = {"none",   "base",     "left",  "right",
                                            "merged", "conflict", "blank", "cycle"};
    std::string text;
    for (const auto& record : resolver.Records()) {
        if (record.resolve == ResolveMerged && !withMerged) continue;
        text += ConflictTypeToStringHuman(record.type) + " " + PathToString(record.path) + ": " +
                kResolves[record.resolve] + "\n";
    }
    return text;
}

MergeOutput Merge(const MergeInput& input) {
    RecordingConflictResolver resolver(TheRules(), input.byDefault);
    std::istringstream decisions("Conflict handling:\n" + input.decisions);
    resolver.SetResolveMethodForPaths(ReadDecisions(decisions));
    const YAMLMappingDiff* left = DiffOf(input.base, input.left);
    const YAMLMappingDiff* right = DiffOf(input.base, input.right);
    const YAMLMappingDiff* merged = MergeMappingDiffs(left, right, resolver);
    EXPECT_EQ(CheckDiff(*merged, DiffOrigin::Sides), "");
    YAMLMapping* body = Doc(input.base);
    merged->Apply(*body);
    EXPECT_EQ(CheckTree(*body, TreeStage::Changed), "");
    std::ostringstream report;
    OutputConflictRecords(report, resolver, true);
    return {Show(body), Records(resolver), report.str(), resolver.HasPendingConflicts()};
}

std::string Merged(const std::string& base, const std::string& left, const std::string& right) {
    return Merge({base, left, right}).body;
}

} // namespace merges
