#include "Premerge.h"

#include "CommandSettings.h"
#include "OutputFile.h"
#include "TimerStat.h"

#include "Session/MergeSession.h"
#include "Session/Thread.h"
#include "Writing/ObjectFileWriter.h"

#include <memory>
#include <ostream>

using namespace ovrin_yaml;

PremergeErrors PremergeBoth(TimerStat& root, const MergeConfig& config, MergeSession& session) {
    // The name announces a clone, but the line stands for nothing: it is part of the listing.
    { TimerStat timer(root, "Clone base roots"); }
    const MergeResolve baseResolve =
        session.Rules().CheckBlankPremergeBaseEnabled() ? ResolveBlank : ResolveBase;
    PremergeErrors errors;
    const auto pass = [&session](MergeResolve resolve, const std::string& path, int& error) {
        const std::unique_ptr<OvrinObjects> objects = session.Premerge(resolve);
        error = WriteOutput(path, [&](std::ostream& stream) { Output(*objects, stream); });
    };
    Thread baseThread([&] { pass(baseResolve, config.premergeBaseDest, errors.base); });
    Thread rightThread([&] { pass(ResolveRight, config.premergeRightDest, errors.right); });
    baseThread.Join();
    rightThread.Join();
    baseThread.CheckForExceptions();
    rightThread.CheckForExceptions();
    return errors;
}
