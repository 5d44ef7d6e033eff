#include "DiffCommand.h"

#include "CommandSettings.h"
#include "Destination.h"
#include "DriverErrors.h"
#include "RulesAndTypes.h"
#include "TimerStat.h"
#include "TwoFiles.h"

#include "Diff/DiffText.h"
#include "Diff/YAMLDiffOutput.h"
#include "Session/MergeSession.h"

#include <iostream>
#include <sstream>

ExitStatus HandleDiffCommand(DiffConfig& config) {
    constexpr std::size_t kIndentWidth = 2;
    TimerStat root("Diff Command", config.timing ? &std::cout : nullptr);
    ovrin_yaml::MergeSession session(ThreadsOf(config.useThreads));
    ReadAndDiff(root, config, session);
    TimerStat timer(root, "Output diff");
    // The text is complete before the destination is touched: an object that can't be shown ends the command.
    std::ostringstream text;
    // A stream keeps to itself that memory is lacking, unless it is told not to.
    text.exceptions(std::ios_base::badbit);
    text << "Diff '" << config.leftFile << "' vs. '" << config.rightFile << "':\n";
    ovrin_yaml::YAMLDiffOutput output(text, kIndentWidth);
    ovrin_yaml::OutputDiff(session.LeftDiff(), output);
    output.Finish();
    const int error =
        Deliver(config.destFile, {text.view().size(), [&](std::ostream& stream) { stream << text.view(); }});
    return error ? FailToWrite(config.destFile, error) : ExitStatus::Done;
}
