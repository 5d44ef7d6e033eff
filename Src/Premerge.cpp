#include "Premerge.h"

#include "CommandSettings.h"
#include "OutputFile.h"
#include "Thread.h"
#include "TimerStat.h"

#include "Merge/DiffMerge.h"
#include "Merge/RecordingConflictResolver.h"
#include "Repair/PostProcess.h"
#include "Writing/ObjectFileWriter.h"

#include <memory>
#include <ostream>

using namespace ovrin_yaml;

namespace {

/// Returns the errno of what can't be written, or 0.
int Premerge(MergeResolve resolve, TimerStat& parent, const std::string& path, OvrinObjects& objects,
             const PremergeInputs& inputs) {
    TimerStat timer(parent, "Premerge " + path);
    RecordingConflictResolver resolver(inputs.rules, resolve);
    const YAMLMappingDiff* merged = nullptr;
    {
        TimerStat mergeTimer(timer, "Merging premerge");
        merged = MergeMappingDiffs(inputs.leftDiff, inputs.rightDiff, resolver);
    }
    {
        TimerStat applyTimer(timer, "Applying premerge merged changes");
        merged->Apply(objects.GetMapping());
        PostProcessMergeOnly(objects.GetMapping(), inputs.left, inputs.right, resolver);
    }
    TimerStat outputTimer(timer, "Output premerge result");
    return WriteOutput(path, [&](std::ostream& stream) { Output(objects, stream); });
}

Thread SpawnPremergeThread(MergeResolve resolve, const std::string& path, OvrinObjects& objects,
                           const PremergeInputs& inputs, int& error) {
    return Thread([=, &path, &objects, &inputs, &error] {
        // Standard output may be the main thread's: the timers of a pass hang under a silent root.
        TimerStat root("Premerge", nullptr);
        error = Premerge(resolve, root, path, objects, inputs);
    });
}

} // namespace

PremergeErrors PremergeBoth(TimerStat& root, const MergeConfig& config, const PremergeInputs& inputs) {
    const std::unique_ptr<OvrinObjects> secondClone(inputs.base.Clone());
    // The name announces the clone, but the line stands for nothing: it is part of the listing.
    { TimerStat timer(root, "Clone base roots"); }
    const MergeResolve baseResolve =
        inputs.rules.CheckBlankPremergeBaseEnabled() ? ResolveBlank : ResolveBase;
    PremergeErrors errors;
    Thread baseThread =
        SpawnPremergeThread(baseResolve, config.premergeBaseDest, *secondClone, inputs, errors.base);
    Thread rightThread =
        SpawnPremergeThread(ResolveRight, config.premergeRightDest, inputs.base, inputs, errors.right);
    baseThread.Join();
    rightThread.Join();
    baseThread.CheckForExceptions();
    rightThread.CheckForExceptions();
    return errors;
}
