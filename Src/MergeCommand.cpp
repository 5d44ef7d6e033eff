#include "MergeCommand.h"

#include "CommandSettings.h"
#include "Destination.h"
#include "DestinationDraft.h"
#include "DriverErrors.h"
#include "Fallback.h"
#include "FileUtils.h"
#include "MergePipeline.h"
#include "SceneExtensions.h"

#include "Values/YAMLError.h"

#include <exception>
#include <new>
#include <optional>

namespace {

/// False after a message.
bool SetupPremergePath(std::string& path) {
    if (path.empty()) path = CreateTempFile();
    if (path.empty()) Fail("Couldn't create temporary output premerge base file for merge result");
    return !path.empty();
}

bool SetupPremergePaths(MergeConfig& config) {
    return !config.premerge ||
           (SetupPremergePath(config.premergeBaseDest) && SetupPremergePath(config.premergeRightDest));
}

/// Returns `status` once the destination holds the file `source`, which `draft` may have followed.
ExitStatus DeliverResult(const std::string& source, const MergeConfig& config, ExitStatus status,
                         DestinationDraft* draft = nullptr) {
    const int error = OutputResultToDestination(source, config.destFile, draft);
    return error ? FailToWrite(config.destFile, error) : status;
}

ExitStatus MergeByTool(const MergeConfig& config, const std::string& output) {
    const ExitStatus result = FallbackMergeTool(config.baseFile, config.leftFile, config.rightFile, output,
                                                config.fallbackSpecFile);
    return result == ExitStatus::Done && !IsMissing(output) ? DeliverResult(output, config, result) : result;
}

/// The tool takes up where the smart merge stopped: its left input is what that merged.
ExitStatus HandConflictsToTool(const MergeConfig& config, const std::string& smartResult) {
    const std::string output2 = CreateTempFile();
    if (output2.empty()) return Fail("Couldn't create temporary output2 file for merge result");
    const std::string& base = config.premerge ? config.premergeBaseDest : config.baseFile;
    const std::string& right = config.premerge ? config.premergeRightDest : config.rightFile;
    const ExitStatus result = FallbackMergeTool(base, smartResult, right, output2, config.fallbackSpecFile);
    if (result != ExitStatus::Done || IsFileEmpty(output2) || IsMissing(output2)) return result;
    return DeliverResult(output2, config, result);
}

ExitStatus MergeSmartly(MergeConfig& config, const std::string& output, bool useFallback) {
    std::optional<DestinationDraft> draft;
    if (config.useThreads) draft.emplace(config.destFile);
    DestinationDraft* const draftOrNull = draft ? &*draft : nullptr;
    ExitStatus result;
    try {
        result = HandleMergeCommand(config, output, draftOrNull);
    } catch (const ovrin_yaml::YAMLError& error) {
        return Fail(error.what());
    } catch (const std::bad_alloc&) {
        throw; // no memory for a message either: main has one ready
    } catch (const std::exception& error) {
        return Fail(error.what());
    }
    if (result == ExitStatus::Failed) return result;
    if (result != ExitStatus::Done && useFallback) return HandConflictsToTool(config, output);
    return DeliverResult(output, config, result, draftOrNull);
}

} // namespace

ExitStatus ProcessMergeCommand(MergeConfig& config) {
    const std::string extension = GetFileExtension(config.leftFile);
    const bool smart = config.force || IsSceneExtension(extension);
    const bool useFallback = config.fallbackSpecFile != kNoSpecFile;
    const std::string output = CreateTempFile();
    if (output.empty()) return Fail("Couldn't create temporary output file for merge result");
    if (!SetupPremergePaths(config)) return ExitStatus::Failed;
    if (smart) return MergeSmartly(config, output, useFallback);
    if (useFallback) return MergeByTool(config, output);
    return Fail("Don't know how to merge " + extension + " files. Consider specifying a specFile argument");
}
