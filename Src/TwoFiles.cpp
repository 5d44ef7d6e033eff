#include "TwoFiles.h"

#include "CommandSettings.h"
#include "ReadInputs.h"
#include "TimerStat.h"

#include "Diff/YAMLMappingDiff.h"
#include "Repair/PreProcess.h"

using namespace ovrin_yaml;

void ReadAndDiff(TimerStat& root, const TwoFileConfig& config, TwoFiles& files) {
    MergeRules rules;
    {
        TimerStat timer(root, "Read files");
        rules = SetupRulesAndTypes(root, timer, config.rulesFile, config.typeInfoFile).rules;
        // The left file plays the base and the right one the changed side, in the names too.
        ReadInputs(
            timer, config.useThreads,
            {{"Read base", &config.leftFile, &files.left}, {"Read left", &config.rightFile, &files.right}});
    }
    { TimerStat timer(root, "Creating mappings"); }
    {
        TimerStat timer(root, "Preprocess mappings");
        PreProcess(files.left.GetMapping());
        PreProcess(files.right.GetMapping());
    }
    TimerStat timer(root, "Creating diff");
    TimerStat diffTimer(timer, "Creating left diff");
    files.diff = YAMLMappingDiff::Diff(rules, &files.left.GetMapping(), &files.right.GetMapping());
}
