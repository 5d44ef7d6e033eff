#include "MergeRun.h"

#include "Thread.h"
#include "TreeComparison.h"

#include "Diff/CheckDiff.h"
#include "Merge/ConflictReport.h"
#include "Merge/DiffMerge.h"
#include "Merge/RecordingConflictResolver.h"
#include "Repair/FileIDCollisions.h"
#include "Repair/PostProcess.h"
#include "Repair/PreProcess.h"
#include "Writing/CheckTree.h"
#include "Writing/ObjectFileWriter.h"

#include <exception>
#include <sstream>
#include <vector>

using namespace ovrin_yaml;

namespace ovrin_fuzz {

namespace {

template <class Write> std::string Written(const Write& write) {
    std::ostringstream stream;
    write(stream);
    return stream.str();
}

/// What a broken invariant is told by.
class BrokenTree final : public std::exception {
public:
    explicit BrokenTree(std::string fault) : m_Fault(std::move(fault)) {}
    const char* what() const noexcept override { return m_Fault.c_str(); }

private:
    std::string m_Fault;
};

void Check(const char* when, const OvrinObjects& objects, TreeStage stage) {
    const std::string fault = CheckTree(objects.GetMapping(), stage);
    if (!fault.empty()) throw BrokenTree(std::string(when) + ": " + fault);
}

/// The diff, checked.
const YAMLMappingDiff* Checked(const char* which, const YAMLMappingDiff* diff, DiffOrigin origin) {
    const std::string fault = CheckDiff(*diff, origin);
    if (!fault.empty()) throw BrokenTree(std::string(which) + " diff: " + fault);
    return diff;
}

void CheckAll(const char* when, const MergeFiles& files, TreeStage baseStage) {
    Check(when, files.base, baseStage);
    Check(when, files.left, TreeStage::Hashed);
    Check(when, files.right, TreeStage::Hashed);
}

struct MergeDiffs {
    const YAMLMappingDiff* left;
    const YAMLMappingDiff* right;
};

/// The diffs to both sides, each on a thread of its own if so wanted.
MergeDiffs Diff(const MergeFiles& files, const MergeWay& way) {
    const YAMLMappingDiff* diffs[2];
    const OvrinObjects* const sides[2] = {&files.left, &files.right};
    std::vector<Thread> threads;
    for (int i = 0; i < 2; ++i)
        threads.emplace_back(
            [&files, &way, &diffs, &sides, i] {
                diffs[i] =
                    YAMLMappingDiff::Diff(way.rules, &files.base.GetMapping(), &sides[i]->GetMapping());
            },
            !way.onThreads);
    for (Thread& thread : threads) thread.Join();
    for (const Thread& thread : threads) thread.CheckForExceptions();
    return {Checked("left", diffs[0], DiffOrigin::Trees), Checked("right", diffs[1], DiffOrigin::Trees)};
}

/// All that comes before the merge itself.
MergeDiffs Prepare(MergeFiles& files, const MergeWay& way) {
    YAMLMapping &base = files.base.GetMapping(), &left = files.left.GetMapping(),
                &right = files.right.GetMapping();
    CheckAll("read", files, TreeStage::Hashed);
    for (YAMLMapping* root : {&base, &left, &right}) PreProcess(*root);
    RemapCollidingAddFileIDs(CreateConflictingFileIDsRemapper(base, left, right), base, left, right);
    CheckAll("prepared", files, TreeStage::Hashed);
    return Diff(files, way);
}

void Merge(MergeFiles& files, const MergeRules& rules, const MergeDiffs& diffs, MergeOutcome& outcome) {
    RecordingConflictResolver resolver(rules, ResolveBase);
    const YAMLMappingDiff* merged =
        Checked("merged", MergeMappingDiffs(diffs.left, diffs.right, resolver), DiffOrigin::Sides);
    CheckAll("merged", files, TreeStage::Hashed);
    merged->Apply(files.base.GetMapping());
    CheckAll("applied", files, TreeStage::Changed);
    PostProcess(files.base.GetMapping(), files.left.GetMapping(), files.right.GetMapping(), {}, resolver);
    CheckAll("repaired", files, TreeStage::Changed);
    outcome.report = Written([&](std::ostream& stream) { OutputConflictRecords(stream, resolver, true); });
    outcome.result = Written([&](std::ostream& stream) { Output(files.base, stream); });
}

std::string Premerge(const MergeRules& rules, MergeResolve resolve, OvrinObjects& base,
                     const MergeFiles& sides, const MergeDiffs& diffs) {
    RecordingConflictResolver resolver(rules, resolve);
    MergeMappingDiffs(diffs.left, diffs.right, resolver)->Apply(base.GetMapping());
    Check("premerge applied", base, TreeStage::Changed);
    PostProcessMergeOnly(base.GetMapping(), sides.left.GetMapping(), sides.right.GetMapping(), resolver);
    Check("premerge repaired", base, TreeStage::Changed);
    return Written([&](std::ostream& stream) { Output(base, stream); });
}

constexpr MergeResolve kPremerges[] = {ResolveBlank, ResolveRight};

void MergeAll(const MergeWay& way, MergeOutcome& outcome) {
    const auto& [read, from, onThreads, rules] = way;
    MergeFiles& files = *outcome.files;
    read(files);
    const MergeDiffs diffs = Prepare(files, way);
    std::vector<std::unique_ptr<OvrinObjects>> clones;
    if (from == PremergeFrom::Clone)
        for (std::size_t i = 0; i < std::size(kPremerges); ++i) clones.emplace_back(files.base.Clone());
    Merge(files, rules, diffs, outcome);
    for (std::size_t i = 0; i < std::size(kPremerges); ++i) {
        if (from == PremergeFrom::Clone) {
            outcome.premerged[i] = Premerge(rules, kPremerges[i], *clones[i], files, diffs);
        } else {
            MergeFiles again;
            read(again);
            const MergeDiffs ownDiffs = Prepare(again, way);
            outcome.premerged[i] = Premerge(rules, kPremerges[i], again.base, again, ownDiffs);
        }
    }
}

} // namespace

MergeOutcome RunMerge(const MergeWay& way) {
    MergeOutcome outcome;
    outcome.files = std::make_shared<MergeFiles>();
    outcome.failure = "none";
    try {
        MergeAll(way, outcome);
    } catch (const YAMLError& error) {
        outcome.failure = error.what();
    } catch (const YAMLError* error) { // of a cycle that can't be broken
        outcome.failure = "cycle: " + error->what();
    } catch (const BrokenTree& fault) {
        outcome.brokenTree = fault.what();
    } catch (const std::exception& error) {
        outcome.failure = std::string("exception: ") + error.what();
    }
    return outcome;
}

std::string CompareOutcomes(const MergeOutcome& expected, const MergeOutcome& actual) {
    if (!actual.brokenTree.empty()) return actual.brokenTree;
    if (!expected.brokenTree.empty()) return expected.brokenTree;
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
