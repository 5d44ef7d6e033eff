// The road of one merge. HandleMergeCommand is its table of contents; each stage is one call.

#include "MergePipeline.h"

#include "CommandSettings.h"
#include "DestinationDraft.h"
#include "DriverErrors.h"
#include "ErrMsg.h"
#include "FileUtils.h"
#include "InputFiles.h"
#include "OutputFile.h"
#include "Premerge.h"
#include "RulesAndTypes.h"
#include "StepTimers.h"

#include "Merge/ConflictReport.h"
#include "Session/MergeSession.h"
#include "Session/Tasks.h"
#include "Writing/ObjectFileWriter.h"

#include <iostream>
#include <sstream>

using namespace ovrin_yaml;

namespace {

void ReadFiles(TimerStat& root, const MergeConfig& config, MergeSession& session) {
    TimerStat timer(root, "Read files");
    auto [rules, types] = SetupRulesAndTypes(root, timer, config.rulesFile, config.typeInfoFile);
    session.SetRules(std::move(rules), std::move(types));
    StepTimers steps(timer);
    session.Read({FileInput(config.baseFile), FileInput(config.leftFile), FileInput(config.rightFile)},
                 &steps);
}

void CreateDiffs(TimerStat& root, MergeSession& session) {
    TimerStat timer(root, "Creating diffs");
    StepTimers steps(timer);
    session.Diff(&steps);
}

/// False, after a message, if the file can't be read.
bool ReadResolveFile(TimerStat& root, const MergeConfig& config, std::vector<RecordResolve>& decisions) {
    if (config.resolveFile.empty()) return true;
    TimerStat timer(root, "Reading resolve file");
    std::string text;
    if (ReadWholeFile(OvrinToNativePath(config.resolveFile), text) != ReadResult::Complete) {
        g_DriverErrors << "Couldn't open merge resolve file '" << config.resolveFile << "'";
        ErrMsg(g_DriverErrors);
        return false;
    }
    std::istringstream stream(std::move(text));
    // It would take a lack of memory for the end of the text.
    stream.exceptions(std::ios_base::badbit);
    decisions = ReadDecisions(stream);
    return true;
}

/// The base is needed again where a premerge can follow.
MergeSession::Base UseOfBase(const MergeConfig& config) {
    const bool mayPremerge = !config.premergeBaseDest.empty() && !config.premergeRightDest.empty();
    return mayPremerge ? MergeSession::Base::Kept : MergeSession::Base::UsedUp;
}

void ApplyMergedChanges(TimerStat& root, const MergeConfig& config, MergeSession& session) {
    TimerStat timer(root, "Applying merged changes");
    session.Apply(UseOfBase(config));
    TimerStat postTimer(timer, "Post process merged changes");
    session.Repair();
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

/// `draft`, where it isn't null, follows the file that is written.
int OutputResult(TimerStat& root, const MergeConfig& config, const std::string& path,
                 const OvrinObjects& result, DestinationDraft* draft) {
    TimerStat timer(root, "Output result");
    const auto write = [&](OutputStream& stream) {
        if (draft) stream.Watch([&](std::uint64_t length) { draft->Follow(path, length); });
        Output(result, stream, RunnerFor(ThreadsOf(config.useThreads)));
    };
    const int error = WriteOutput(path, write);
    // Without the draft there is more room on the disk.
    return error && draft && draft->GiveUp() ? WriteOutput(path, write) : error;
}

/// Premerged files that can't be written are lost without a word where nobody is to work on them. Returns
/// Done; Failed, after a message, if a tool would.
ExitStatus PremergeForTool(TimerStat& root, const MergeConfig& config, MergeSession& session) {
    const PremergeErrors errors = PremergeBoth(root, config, session);
    if (!config.premerge || config.fallbackSpecFile == kNoSpecFile) return ExitStatus::Done;
    if (errors.base) return FailToWrite(config.premergeBaseDest, errors.base);
    if (errors.right) return FailToWrite(config.premergeRightDest, errors.right);
    return ExitStatus::Done;
}

} // namespace

ExitStatus HandleMergeCommand(const MergeConfig& config, const std::string& outputPath,
                              DestinationDraft* draft) {
    TimerStat root("Merging", config.timing ? &std::cout : nullptr);
    MergeSession session(ThreadsOf(config.useThreads));
    ReadFiles(root, config, session);
    { TimerStat timer(root, "Creating mappings"); }
    {
        TimerStat timer(root, "Preprocess mappings");
        session.Prepare();
    }
    CreateDiffs(root, session);
    std::vector<RecordResolve> decisions;
    if (!ReadResolveFile(root, config, decisions)) return ExitStatus::Failed;
    session.Decide(std::move(decisions), config.resolve);
    {
        TimerStat timer(root, "Merging");
        session.Merge();
    }
    { TimerStat timer(root, "Cloning base roots"); }
    ApplyMergedChanges(root, config, session);
    if (const int error = OutputConflicts(root, config, session.Resolver())) return FailToWrite({}, error);
    const bool hasConflicts = session.Resolver().HasPendingConflicts();
    const bool isForTool = hasConflicts && config.fallbackSpecFile != kNoSpecFile;
    const bool isPremerged = hasConflicts && UseOfBase(config) == MergeSession::Base::Kept;
    // Premerged files come before the delivery, and may need the room on the disk.
    DestinationDraft* const follower = isForTool || isPremerged ? nullptr : draft;
    if (const int error = OutputResult(root, config, outputPath, session.Result(), follower))
        return FailToWrite(outputPath, error);
    if (!hasConflicts) return ExitStatus::Done;
    if (isPremerged && PremergeForTool(root, config, session) != ExitStatus::Done) return ExitStatus::Failed;
    return session.HasBrokenDependencies() ? ExitStatus::BrokenDependencies : ExitStatus::Conflicts;
}
