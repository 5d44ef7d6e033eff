#include "StripCommand.h"

#include "CommandSettings.h"
#include "Destination.h"
#include "DriverErrors.h"
#include "RulesAndTypes.h"
#include "TimerStat.h"
#include "TwoFiles.h"

#include "Diff/YAMLMappingDiff.h"
#include "Session/MergeSession.h"
#include "Values/YAMLMapping.h"
#include "Writing/ObjectFileWriter.h"

#include <iostream>
#include <sstream>
#include <vector>

using namespace ovrin_yaml;

namespace {

bool IsHeaderKey(const YAMLScalar* key) {
    return key == YAMLScalar::fileIDPlaceHolderName || key == YAMLScalar::classIDPlaceHolderName;
}

/// Cuts `mapping` down to the keys that `diff` touches and, in an object, those that name it. A changed
/// sequence stays whole.
void StripUnchangedMapping(YAMLMapping& mapping, const YAMLMappingDiff& diff) {
    std::vector<const YAMLScalar*> unchanged;
    for (const auto& [key, value] : mapping) {
        const Operation* operation = diff.Find(key);
        if (!operation && !IsHeaderKey(key)) unchanged.push_back(key);
        if (const auto* change = As<ChangeMappingOperation>(operation))
            StripUnchangedMapping(ToMapping(mapping.GetForChange(key)), *change->m_Diff);
    }
    for (const YAMLScalar* key : unchanged) mapping.Remove(key);
}

} // namespace

ExitStatus HandleStripCommand(StripConfig& config) {
    TimerStat root("Strip Command", config.timing ? &std::cout : nullptr);
    MergeSession session(ThreadsOf(config.useThreads));
    ReadAndDiff(root, config, session);
    StripUnchangedMapping(session.LeftObjects().GetMapping(), session.LeftDiff());
    TimerStat timer(root, "Output result");
    // The text is complete before the destination is touched: an object that can't be written ends the
    // command.
    std::ostringstream text;
    // A stream keeps to itself that memory is lacking, unless it is told not to.
    text.exceptions(std::ios_base::badbit);
    Output(session.LeftObjects(), text);
    const int error =
        Deliver(config.destFile, {text.view().size(), [&](std::ostream& stream) { stream << text.view(); }});
    return error ? FailToWrite(config.destFile, error) : ExitStatus::Done;
}
