#include "SmallChecks.h"

#include "Diff/MergeRules.h"
#include "Merge/ConflictReport.h"

#include <sstream>
#include <stdexcept>

using namespace ovrin_yaml;

namespace ovrin_fuzz {

namespace {

/// Reads decisions. Returns the failure, or an empty text.
std::string Read(const std::string& text, RecordingConflictResolver& resolver) {
    std::istringstream stream(text);
    try {
        resolver.SetResolveMethodForPaths(ReadDecisions(stream));
    } catch (const std::runtime_error& error) {
        return error.what();
    }
    return "";
}

std::string Report(const RecordingConflictResolver& resolver) {
    std::ostringstream stream;
    OutputConflictRecords(stream, resolver, false);
    return stream.str();
}

/// The first decision whose pattern matches, by a search through all.
std::optional<MergeResolve> Search(const std::vector<RecordResolve>& decisions, const Path& path) {
    for (const RecordResolve& decision : decisions) {
        const bool reachesKeyLists =
            path[0] != YAMLScalar::underscore || decision.path[0] == YAMLScalar::underscore;
        if (reachesKeyLists && MergeRules::MatchesPath(decision.path, path)) return decision.resolve;
    }
    return std::nullopt;
}

std::string CheckTable(const std::vector<RecordResolve>& decisions) {
    ResolveTable table;
    table.Set(decisions);
    for (const RecordResolve& decision : decisions) {
        Path path = decision.path;
        for (std::size_t i = 0; i <= path.size(); ++i) {
            if (table.Find(path) != Search(decisions, path))
                return "another decision than the first for " + PathToString(path);
            if (i < path.size()) path[i] = YAMLScalar::one;
        }
    }
    return "";
}

} // namespace

std::string CheckResolve(std::string_view input) {
    const MergeRules rules;
    RecordingConflictResolver resolver(rules, ResolveBase), again(rules, ResolveBase);
    const std::string failure = Read(std::string(input), resolver);
    const std::vector<RecordResolve>& decisions = resolver.Resolves();
    if (!failure.empty()) return decisions.empty() ? "" : "decisions of a file that failed: " + failure;
    const std::string report = Report(resolver);
    const std::string reportFailure = Read(report, again);
    if (!reportFailure.empty()) return "the report can't be read: " + reportFailure + "\n" + report;
    if (again.Resolves().size() != decisions.size() || Report(again) != report)
        return "the report\n" + report + "is read as\n" + Report(again);
    for (std::size_t i = 0; i < decisions.size(); ++i)
        if (again.Resolves()[i].path != decisions[i].path)
            return "another path for " + PathToString(decisions[i].path);
    return CheckTable(decisions);
}

} // namespace ovrin_fuzz
