// The road of one merge. HandleMergeCommand is its table of contents; each stage is one call.

#include "MergePipeline.h"

#include "CommandSettings.h"
#include "DriverErrors.h"
#include "ErrMsg.h"
#include "FileUtils.h"
#include "OutputFile.h"
#include "Premerge.h"
#include "ReadInputs.h"
#include "Thread.h"
#include "TimerStat.h"

#include "Diff/YAMLMappingDiff.h"
#include "Merge/ConflictReport.h"
#include "Merge/DiffMerge.h"
#include "Merge/RecordingConflictResolver.h"
#include "Repair/FileIDCollisions.h"
#include "Repair/PostProcess.h"
#include "Repair/PreProcess.h"
#include "Values/OvrinObjects.h"
#include "Values/YAMLError.h"
#include "Writing/ObjectFileWriter.h"

#include <iostream>
#include <memory>
#include <sstream>

using namespace ovrin_yaml;

namespace {

/// The three files of a merge. The result is built in the base.
struct MergeFiles {
    OvrinObjects base, left, right;
};

struct MergeDiffs {
    const YAMLMappingDiff* left = nullptr;
    const YAMLMappingDiff* right = nullptr;
};

RulesAndTypes ReadFiles(TimerStat& root, const MergeConfig& config, MergeFiles& files) {
    TimerStat timer(root, "Read files");
    RulesAndTypes rulesAndTypes = SetupRulesAndTypes(root, timer, config.rulesFile, config.typeInfoFile);
    ReadInputs(timer, config.useThreads,
               {{"Read base", &config.baseFile, &files.base},
                {"Read left", &config.leftFile, &files.left},
                {"Read right", &config.rightFile, &files.right}});
    return rulesAndTypes;
}

void PreProcessFile(const std::string& path, OvrinObjects& objects) {
    try {
        PreProcess(objects.GetMapping());
    } catch (const YAMLError& error) {
        throw YAMLError("Cannot merge file '" + path + "': " + error.what());
    }
}

void PreProcessMappings(TimerStat& root, const MergeConfig& config, MergeFiles& files) {
    TimerStat timer(root, "Preprocess mappings");
    PreProcessFile(config.baseFile, files.base);
    PreProcessFile(config.leftFile, files.left);
    PreProcessFile(config.rightFile, files.right);
    const YAMLMapping& base = files.base.GetMapping();
    const YAMLMapping& left = files.left.GetMapping();
    YAMLMapping& right = files.right.GetMapping();
    RemapCollidingAddFileIDs(CreateConflictingFileIDsRemapper(base, left, right), base, left, right);
}

MergeDiffs DiffOnThreads(TimerStat& timer, const MergeRules& rules, const MergeFiles& files) {
    constexpr std::size_t kFewObjects = 1000;
    const YAMLMapping& base = files.base.GetMapping();
    const bool isLittle = base.Size() < kFewObjects;
    MergeDiffs diffs;
    Thread left([&] { diffs.left = YAMLMappingDiff::Diff(rules, &base, &files.left.GetMapping()); },
                isLittle);
    Thread right([&] { diffs.right = YAMLMappingDiff::Diff(rules, &base, &files.right.GetMapping()); },
                 isLittle);
    {
        TimerStat waitTimer(timer, "Waiting for left diff");
        left.Join();
        right.Join();
    }
    left.CheckForExceptions();
    right.CheckForExceptions();
    return diffs;
}

MergeDiffs CreateDiffs(TimerStat& root, const MergeConfig& config, const MergeRules& rules,
                       const MergeFiles& files) {
    TimerStat timer(root, "Creating diffs");
    if (config.useThreads) return DiffOnThreads(timer, rules, files);
    MergeDiffs diffs;
    {
        TimerStat leftTimer(timer, "Creating left diff");
        diffs.left = YAMLMappingDiff::Diff(rules, &files.base.GetMapping(), &files.left.GetMapping());
    }
    TimerStat rightTimer(timer, "Creating right diff");
    diffs.right = YAMLMappingDiff::Diff(rules, &files.base.GetMapping(), &files.right.GetMapping());
    return diffs;
}

/// False, after a message, if the file can't be read.
bool ReadResolveFile(TimerStat& root, const MergeConfig& config, RecordingConflictResolver& resolver) {
    if (config.resolveFile.empty()) return true;
    TimerStat timer(root, "Reading resolve file");
    std::string text;
    if (ReadWholeFile(OvrinToNativePath(config.resolveFile), text) != ReadResult::Complete) {
        g_DriverErrors << "Couldn't open merge resolve file '" << config.resolveFile << "'";
        ErrMsg(g_DriverErrors);
        return false;
    }
    std::istringstream stream(std::move(text));
    InputConflictRecords(stream, resolver);
    return true;
}

/// Null where no premerge can follow: nobody else reads the base once it is changed.
std::unique_ptr<OvrinObjects> CloneBase(TimerStat& root, const MergeConfig& config, OvrinObjects& base) {
    TimerStat timer(root, "Cloning base roots");
    if (config.premergeBaseDest.empty() || config.premergeRightDest.empty()) return nullptr;
    return std::unique_ptr<OvrinObjects>(base.Clone());
}

/// Returns whether component dependencies were found broken.
bool ApplyMergedChanges(TimerStat& root, const YAMLMappingDiff& merged, MergeFiles& files,
                        const YAMLTypeInfoManager& types, RecordingConflictResolver& resolver) {
    TimerStat timer(root, "Applying merged changes");
    merged.Apply(files.base.GetMapping());
    TimerStat postTimer(timer, "Post process merged changes");
    return PostProcess(files.base.GetMapping(), files.left.GetMapping(), files.right.GetMapping(), types,
                       resolver);
}

/// A report that can't be written is lost without a word, but for one that shares standard output with the
/// result. Returns errno or 0.
int OutputConflicts(TimerStat& root, const MergeConfig& config, const RecordingConflictResolver& resolver) {
    TimerStat timer(root, "Output conflicts");
    const int error = WriteOutput(config.conflictFile, [&](std::ostream& stream) {
        OutputConflictRecords(stream, resolver, config.describe);
    });
    return config.conflictFile.empty() && config.destFile.empty() ? error : 0;
}

int OutputResult(TimerStat& root, const std::string& path, const OvrinObjects& result) {
    TimerStat timer(root, "Output result");
    return WriteOutput(path, [&](std::ostream& stream) { Output(result, stream); });
}

/// Premerged files that can't be written are lost without a word where nobody is to work on them. Returns 0;
/// 1, after a message, if a tool would.
int PremergeForTool(TimerStat& root, const MergeConfig& config, const PremergeInputs& inputs) {
    const PremergeErrors errors = PremergeBoth(root, config, inputs);
    if (!config.premerge || config.fallbackSpecFile == kNoSpecFile) return 0;
    if (errors.base) return FailToWrite(config.premergeBaseDest, errors.base);
    if (errors.right) return FailToWrite(config.premergeRightDest, errors.right);
    return 0;
}

} // namespace

int HandleMergeCommand(const MergeConfig& config, const std::string& outputPath) {
    TimerStat root("Merging", config.timing ? &std::cout : nullptr);
    MergeFiles files;
    const RulesAndTypes known = ReadFiles(root, config, files);
    RecordingConflictResolver resolver(known.rules, config.resolve);
    { TimerStat timer(root, "Creating mappings"); }
    PreProcessMappings(root, config, files);
    const MergeDiffs diffs = CreateDiffs(root, config, known.rules, files);
    if (!ReadResolveFile(root, config, resolver)) return 1;
    const YAMLMappingDiff* merged = nullptr;
    {
        TimerStat timer(root, "Merging");
        merged = MergeMappingDiffs(diffs.left, diffs.right, resolver);
    }
    const std::unique_ptr<OvrinObjects> baseClone = CloneBase(root, config, files.base);
    const bool hasComponentDependencyConflicts =
        ApplyMergedChanges(root, *merged, files, known.types, resolver);
    if (const int error = OutputConflicts(root, config, resolver)) return FailToWrite({}, error);
    if (const int error = OutputResult(root, outputPath, files.base)) return FailToWrite(outputPath, error);
    if (!resolver.HasPendingConflicts()) return 0;
    if (baseClone && PremergeForTool(root, config,
                                     {known.rules, *baseClone, files.left.GetMapping(),
                                      files.right.GetMapping(), diffs.left, diffs.right}) != 0)
        return 1;
    return hasComponentDependencyConflicts ? 3 : 2;
}
