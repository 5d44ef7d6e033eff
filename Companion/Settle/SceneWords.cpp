#include "Settle/SceneWords.h"

#include "Conflicts/Conflict.h"
#include "Conflicts/ConflictReport.h"
#include "Names/PrintableText.h"
#include "Settle/SceneCount.h"
#include "Settle/SettleSession.h"
#include "Systems/Operation.h"
#include "Systems/Repository.h"
#include "Systems/UnmergedFiles.h"

#include <nlohmann/json.hpp>

namespace ovrin {

using namespace ovrin_yaml;
using nlohmann::json;

namespace {

constexpr std::size_t kValueWidth = 100;

std::string TellState(const SettleSession::Met& met) {
    return met.decided ? std::string("settled, ") + SideName(*met.decided)
                       : "settled by what was decided of another place";
}

json ToJson(const Problem& problem) {
    json remedies = json::array();
    for (const Remedy& remedy : problem.remedies) {
        json decisions = json::array();
        for (const Decision& decision : remedy.decisions)
            decisions.push_back({{"path", decision.path}, {"side", SideName(decision.side)}});
        remedies.push_back({{"text", remedy.text}, {"decisions", decisions}});
    }
    return {{"text", problem.text}, {"remedies", remedies}};
}

} // namespace

std::vector<std::string> NextSteps(const Repository& repository, const std::string& action) {
    std::vector<std::string> steps;
    const std::vector<std::string> unmerged = UnmergedFiles(repository);
    if (!unmerged.empty())
        steps.push_back("Still unmerged: " + Printable(unmerged.front()) +
                        (unmerged.size() > 1 ? " and " + std::to_string(unmerged.size() - 1) + " more" : ""));
    const std::string proceed = OperationIn(repository).proceed;
    if (!proceed.empty())
        steps.push_back((unmerged.empty() ? "Next: " : "Then: ") + proceed);
    else if (action == "stash")
        steps.emplace_back("The stash is applied and was kept: \"git stash drop\" removes it");
    return steps;
}

std::string TellConflicts(SettleSession& session) {
    const ConflictWords words(session.Merge(), kValueWidth);
    const SideLabels labels = SideLabels::Of(session.Source().occasion);
    std::string text, heading;
    for (const SettleSession::Met& met : session.Conflicts()) {
        const Conflict conflict = words.Describe(*met.conflict);
        if (conflict.heading != heading) text += (heading = conflict.heading) + '\n';
        if (met.isOpen)
            text += TellConflict(conflict, labels);
        else
            text +=
                "  " + (conflict.property.empty() ? "" : conflict.property + ": ") + TellState(met) + '\n';
        if (met.isOpen && met.decided)
            text += std::string("    taken: ") + SideName(*met.decided) + ", but " + kStillLoop + '\n';
        if (met.proposed) text += std::string("    proposed: ") + SideName(*met.proposed) + '\n';
        text += "    path    " + Printable(conflict.path) + '\n';
    }
    for (const Problem& problem : session.Problems()) text += "  problem: " + problem.text + '\n';
    return text;
}

json ToJson(SettleSession& session) {
    const ConflictWords words(session.Merge());
    json written = ToJson(SceneCount::Of(session));
    json& conflicts = written["conflicts"] = json::array();
    for (const SettleSession::Met& met : session.Conflicts()) {
        json conflict = ToJson(words.Describe(*met.conflict));
        conflict["state"] = met.isOpen ? "open" : "settled";
        conflict["decided"] = met.decided ? json(SideName(*met.decided)) : json();
        conflict["proposed"] = met.proposed ? json(SideName(*met.proposed)) : json();
        conflicts.push_back(std::move(conflict));
    }
    json& problems = written["problems"] = json::array();
    for (const Problem& problem : session.Problems()) problems.push_back(ToJson(problem));
    return written;
}

} // namespace ovrin
