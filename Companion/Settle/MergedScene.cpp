#include "Settle/MergedScene.h"

#include "Conflicts/DecisionPath.h"
#include "Scenes/SceneRules.h"
#include "Systems/WorkerProcesses.h"
#include "Words/Failure.h"

#include <cstdint>
#include <nlohmann/json.hpp>
#include <utility>

namespace ovrin {

using namespace ovrin_yaml;
using nlohmann::json;

namespace {

constexpr char kWorked = '+', kFailed = '-'; // ahead of what was made, or of why nothing was

json ToJson(const std::vector<Decision>& decisions) {
    json written = json::array();
    for (const Decision& decision : decisions)
        written.push_back(json::array({decision.path, static_cast<int>(decision.side)}));
    return written;
}

json ToJson(const std::vector<Problem>& problems) {
    json written = json::array();
    for (const Problem& problem : problems) {
        json remedies = json::array();
        for (const Remedy& remedy : problem.remedies)
            remedies.push_back(json::array({remedy.text, ToJson(remedy.decisions)}));
        written.push_back(json::array({problem.text, remedies}));
    }
    return written;
}

std::vector<Problem> ProblemsFrom(const json& written) {
    std::vector<Problem> problems;
    for (const json& problem : written) {
        problems.push_back({problem[0], {}});
        for (const json& remedy : problem[1]) {
            problems.back().remedies.push_back({remedy[0], {}});
            for (const json& decision : remedy[1])
                problems.back().remedies.back().decisions.push_back(
                    {decision[0], static_cast<Side>(decision[1].get<int>())});
        }
    }
    return problems;
}

} // namespace

SceneMerge SceneMergeOf(const OpenMerge& merge) {
    FormatFiles files;
    if (!merge.rules.empty()) files.rules = merge.rules;
    if (!merge.typeInfo.empty()) files.typeInfo = merge.typeInfo;
    SceneRules rules = ReadSceneRules(files);
    return SceneMerge(merge.texts, std::move(rules.rules), std::move(rules.types));
}

std::string MergeApartTo(SceneMerge& merge, const std::vector<Decision>& decisions, Side take,
                         const std::function<std::string()>& make) {
    const auto work = [&](std::size_t) {
        try {
            MergeHere(merge, decisions, take);
            return kWorked + make();
        } catch (const Failure& failure) {
            return kFailed + std::string(failure.what());
        }
    };
    const std::uint64_t size = 1;
    WorkerAnswer answer;
    WorkInProcesses({&size, 1}, {1, 1, 1}, work,
                    [&](std::size_t, WorkerAnswer got) { answer = std::move(got); });
    if (!answer.text) throw Failure("The scene can't be merged: the process for it was " + answer.end);
    std::string made = answer.text->substr(1);
    if (answer.text->front() == kFailed) throw Failure(made);
    return made;
}

MergedScene MergeApart(SceneMerge& merge, const MergeNames& names, const std::vector<Decision>& decisions,
                       Side take) {
    // In a form that keeps any bytes of a path.
    const std::string merged = MergeApartTo(merge, decisions, take, [&] {
        std::vector<std::string> open, unmatched;
        for (const OpenConflict& conflict : merge.Open()) open.push_back(DecisionPath(conflict.path));
        for (const Decision& decision : merge.Unmatched()) unmatched.push_back(decision.path);
        std::string written;
        json::to_cbor(json::array({open, unmatched, ToJson(FindProblems(merge, names))}), written);
        return written;
    });
    const json read = json::from_cbor(merged);
    return {read[0], read[1], ProblemsFrom(read[2])};
}

void MergeHere(SceneMerge& merge, const std::vector<Decision>& decisions, Side take) {
    // The engine goes by the first decision that matches.
    merge.Merge(std::vector<Decision>(decisions.rbegin(), decisions.rend()), take);
}

} // namespace ovrin
