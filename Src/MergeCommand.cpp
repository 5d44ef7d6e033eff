#include "MergeCommand.h"

#include "CommandSettings.h"
#include "Destination.h"
#include "DriverErrors.h"
#include "Fallback.h"
#include "FileUtils.h"
#include "MergePipeline.h"

#include "Values/YAMLError.h"

#include <algorithm>
#include <exception>
#include <iterator>
#include <new>

namespace {

bool IsSmartExtension(const std::string& extension) {
    static const char* const kSmartExtensions[] = {"ovrin", "prefab", "meta", "OVR", "PRE", "MET"};
    return std::find(std::begin(kSmartExtensions), std::end(kSmartExtensions), extension) !=
           std::end(kSmartExtensions);
}

int SetupPremergePath(std::string& path) {
    if (path.empty()) path = CreateTempFile();
    return path.empty() ? Fail("Couldn't create temporary output premerge base file for merge result") : 0;
}

int SetupPremergePaths(MergeConfig& config) {
    if (!config.premerge) return 0;
    if (const int failure = SetupPremergePath(config.premergeBaseDest)) return failure;
    return SetupPremergePath(config.premergeRightDest);
}

/// Returns `status` once the destination holds the file `source`.
int DeliverResult(const std::string& source, const MergeConfig& config, int status) {
    const int error = OutputResultToDestination(source, config.destFile);
    return error ? FailToWrite(config.destFile, error) : status;
}

int MergeByTool(const MergeConfig& config, const std::string& output) {
    const int result = FallbackMergeTool(config.baseFile, config.leftFile, config.rightFile, output,
                                         config.fallbackSpecFile);
    return result == 0 && !IsMissing(output) ? DeliverResult(output, config, 0) : result;
}

/// The tool takes up where the smart merge stopped: its left input is what that merged.
int HandConflictsToTool(const MergeConfig& config, const std::string& smartResult) {
    const std::string output2 = CreateTempFile();
    if (output2.empty()) return Fail("Couldn't create temporary output2 file for merge result");
    const std::string& base = config.premerge ? config.premergeBaseDest : config.baseFile;
    const std::string& right = config.premerge ? config.premergeRightDest : config.rightFile;
    const int result = FallbackMergeTool(base, smartResult, right, output2, config.fallbackSpecFile);
    if (result != 0 || IsFileEmpty(output2) || IsMissing(output2)) return result;
    return DeliverResult(output2, config, 0);
}

int MergeSmartly(MergeConfig& config, const std::string& output, bool useFallback) {
    int result = 0;
    try {
        result = HandleMergeCommand(config, output);
    } catch (const ovrin_yaml::YAMLError& error) {
        return Fail(error.what());
    } catch (const std::bad_alloc&) {
        throw; // no memory for a message either: main has one ready
    } catch (const std::exception& error) {
        return Fail(error.what());
    }
    if (result == 1) return 1;
    if (result != 0 && useFallback) return HandConflictsToTool(config, output);
    return DeliverResult(output, config, result);
}

} // namespace

int ProcessMergeCommand(MergeConfig& config) {
    const std::string extension = GetFileExtension(config.leftFile);
    const bool smart = config.force || IsSmartExtension(extension);
    const bool useFallback = config.fallbackSpecFile != kNoSpecFile;
    const std::string output = CreateTempFile();
    if (output.empty()) return Fail("Couldn't create temporary output file for merge result");
    if (const int failure = SetupPremergePaths(config)) return failure;
    if (smart) return MergeSmartly(config, output, useFallback);
    if (useFallback) return MergeByTool(config, output);
    return Fail("Don't know how to merge " + extension + " files. Consider specifying a specFile argument");
}
