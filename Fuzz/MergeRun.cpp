#include "MergeRun.h"

#include "TreeComparison.h"

#include "Diff/YAMLMappingDiff.h"
#include "Merge/ConflictReport.h"
#include "Merge/RecordingConflictResolver.h"
#include "Repair/FileIDCollisions.h"
#include "Repair/PostProcess.h"
#include "Repair/PreProcess.h"

#include <exception>
#include <sstream>

using namespace ovrin_yaml;

namespace ovrin_fuzz {

namespace {

template <class Write> std::string Written(const Write& write) {
    std::ostringstream stream;
    write(stream);
    return stream.str();
}

std::string Premerge(MergeResolve resolve, OvrinObjects& base, const MergeFiles& files,
                     const YAMLMappingDiff* left, const YAMLMappingDiff* right) {
    RecordingConflictResolver resolver(resolve);
    YAMLMappingDiff::Merge(left, right, resolver)->Apply(base.GetMapping());
    PostProcessMergeOnly(base.GetMapping(), files.left.GetMapping(), files.right.GetMapping(), resolver);
    return Written([&](std::ostream& stream) { base.Output(stream); });
}

void Merge(MergeFiles& files, MergeOutcome& outcome) {
    YAMLMapping &base = files.base.GetMapping(), &left = files.left.GetMapping(),
                &right = files.right.GetMapping();
    for (YAMLMapping* root : {&base, &left, &right}) PreProcess(*root);
    RemapCollidingAddFileIDs(CreateConflictingFileIDsRemapper(base, left, right), base, left, right);
    const YAMLMappingDiff* leftDiff = YAMLMappingDiff::Diff(&base, &left);
    const YAMLMappingDiff* rightDiff = YAMLMappingDiff::Diff(&base, &right);
    RecordingConflictResolver resolver(ResolveBase);
    const YAMLMappingDiff* merged = YAMLMappingDiff::Merge(leftDiff, rightDiff, resolver);
    const std::unique_ptr<OvrinObjects> forBlank(files.base.Clone()), forRight(files.base.Clone());

    merged->Apply(base);
    bool hasBrokenDependencies = false;
    PostProcess(base, left, right, resolver, hasBrokenDependencies);
    outcome.report = Written([&](std::ostream& stream) { OutputConflictRecords(stream, resolver, true); }) +
                     (hasBrokenDependencies ? "broken dependencies" : "");
    outcome.result = Written([&](std::ostream& stream) { files.base.Output(stream); });
    outcome.premerged[0] = Premerge(ResolveBlank, *forBlank, files, leftDiff, rightDiff);
    outcome.premerged[1] = Premerge(ResolveRight, *forRight, files, leftDiff, rightDiff);
}

} // namespace

MergeOutcome RunMerge(const std::function<void(MergeFiles&)>& read) {
    MergeOutcome outcome;
    outcome.files = std::make_shared<MergeFiles>();
    outcome.failure = "none";
    try {
        read(*outcome.files);
        Merge(*outcome.files, outcome);
    } catch (const YAMLError& error) {
        outcome.failure = error.what();
    } catch (const YAMLError* error) { // of a cycle that can't be broken
        outcome.failure = "cycle: " + error->what();
    } catch (const std::exception& error) {
        outcome.failure = std::string("exception: ") + error.what();
    }
    return outcome;
}

std::string CompareOutcomes(const MergeOutcome& expected, const MergeOutcome& actual) {
    const auto compare = [](const char* what, const std::string& left, const std::string& right) {
        return left == right ? "" : std::string(what) + ":\n" + left + "\nand\n" + right + "\n";
    };
    std::string difference = compare("failure", expected.failure, actual.failure) +
                             compare("report", expected.report, actual.report) +
                             compare("result", expected.result, actual.result) +
                             compare("premerged with blanks", expected.premerged[0], actual.premerged[0]) +
                             compare("premerged right", expected.premerged[1], actual.premerged[1]);
    // A failed reading leaves what it has, which depends on the order.
    if (!difference.empty() || expected.failure != "none") return difference;
    for (const auto file : {&MergeFiles::base, &MergeFiles::left, &MergeFiles::right})
        difference += FirstDifference((expected.files.get()->*file).GetMapping(),
                                      (actual.files.get()->*file).GetMapping());
    return difference.empty() ? "" : "trees after the merge:" + difference;
}

} // namespace ovrin_fuzz
