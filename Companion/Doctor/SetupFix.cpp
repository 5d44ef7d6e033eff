#include "Doctor/SetupFix.h"

#include "Setup/SetupRun.h"
#include "Words/Failure.h"

namespace ovrin {

std::function<std::string()> FixBySetup(const std::string& system, Scope scope) {
    return [system, scope] {
        SetupReport report = RunSetup({.system = system, .scope = scope});
        while (report.words.ends_with('\n')) report.words.pop_back();
        if (report.failures > 0) throw Failure(report.words);
        std::string words = "\"ovrin setup " + system + (scope == Scope::Local ? " --local\"" : "\"");
        if (report.changed.empty()) return words + " found nothing to change";
        words += " changed ";
        for (const std::string& file : report.changed)
            words += (&file == report.changed.data() ? "" : ", ") + file;
        return words;
    };
}

} // namespace ovrin
