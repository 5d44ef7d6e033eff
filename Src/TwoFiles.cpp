#include "TwoFiles.h"

#include "CommandSettings.h"
#include "InputFiles.h"
#include "RulesAndTypes.h"
#include "StepTimers.h"

#include "Session/MergeSession.h"

using namespace ovrin_yaml;

namespace {

void ReadFiles(TimerStat& root, const TwoFileConfig& config, MergeSession& session) {
    TimerStat timer(root, "Read files");
    auto [rules, types] = SetupRulesAndTypes(root, timer, config.rulesFile, config.typeInfoFile);
    session.SetRules(std::move(rules), std::move(types));
    StepTimers steps(timer);
    session.Read({FileInput(config.leftFile), FileInput(config.rightFile)}, &steps);
}

void CreateDiff(TimerStat& root, MergeSession& session) {
    TimerStat timer(root, "Creating diff");
    StepTimers steps(timer);
    session.Diff(&steps);
}

} // namespace

void ReadAndDiff(TimerStat& root, const TwoFileConfig& config, MergeSession& session) {
    try {
        ReadFiles(root, config, session);
        { TimerStat timer(root, "Creating mappings"); }
        {
            TimerStat timer(root, "Preprocess mappings");
            session.Prepare();
        }
        CreateDiff(root, session);
    } catch (const MergeError& error) {
        // These commands die of it, and the system tells its type. Nothing is told of a merge.
        throw YAMLError(error.stage == MergeError::Stage::Prepare ? error.reason : error.what());
    }
}
