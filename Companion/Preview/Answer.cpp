#include "Preview/Answer.h"

#include "Words/Failure.h"

#include <array>

namespace ovrin {

namespace {

using nlohmann::json;

constexpr int kVersion = 1;

constexpr std::array<const char*, 3> kVerdicts = {"clean", "conflicts", "unknown"};
constexpr std::array<const char*, 5> kMeetings = {"both-changed", "both-added", "ours-removed",
                                                  "theirs-removed", "misplaced"};

template <class Value, std::size_t count>
Value Named(const std::array<const char*, count>& names, const std::string& name) {
    for (std::size_t i = 0; i < count; ++i)
        if (name == names[i]) return static_cast<Value>(i);
    throw Failure("\"" + name + "\" isn't known to this version of ovrin");
}

json ToJson(const NamedCommit& commit) {
    return {{"name", commit.name}, {"commit", commit.id}};
}

NamedCommit CommitOf(const json& json) {
    return {json.at("name"), json.at("commit")};
}

json ToJson(const ScenesInSum& sum) {
    return {{"scenes", sum.all},
            {"conflicting", sum.conflicting},
            {"unknown", sum.unknown},
            {"byLines", sum.byLines}};
}

} // namespace

ScenesInSum Sum(const PreviewAnswer& answer) {
    ScenesInSum sum;
    for (const PreviewedScene& scene : answer.scenes) {
        ++sum.all;
        if (scene.verdict == Verdict::Conflicts) ++sum.conflicting;
        if (scene.verdict == Verdict::Unknown) ++sum.unknown;
        if (!scene.isByObjects) ++sum.byLines;
    }
    return sum;
}

json ToJson(const PreviewedScene& scene) {
    return {{"number", scene.number},
            {"path", scene.path},
            {"sides", kMeetings[static_cast<std::size_t>(scene.meeting)]},
            {"verdict", kVerdicts[static_cast<std::size_t>(scene.verdict)]},
            {"mergedBy", scene.isByObjects ? "objects" : "lines"},
            {"git", scene.gitConflicts},
            {"problem", scene.problem},
            {"conflicts", scene.conflicts},
            {"report", scene.report}};
}

PreviewedScene SceneOfJson(const json& json) {
    PreviewedScene scene;
    scene.number = json.at("number");
    scene.path = json.at("path");
    scene.meeting = Named<Meeting>(kMeetings, json.at("sides"));
    scene.verdict = Named<Verdict>(kVerdicts, json.at("verdict"));
    scene.isByObjects = json.at("mergedBy") == "objects";
    scene.gitConflicts = json.at("git").get<std::vector<std::string>>();
    scene.problem = json.at("problem");
    scene.conflicts = json.at("conflicts");
    scene.report = json.at("report");
    return scene;
}

std::string ToJson(const PreviewAnswer& answer) {
    json scenes = json::array();
    for (const PreviewedScene& scene : answer.scenes) scenes.push_back(ToJson(scene));
    const json written = {
        {"version", kVersion},         {"ours", ToJson(answer.ours)}, {"theirs", ToJson(answer.theirs)},
        {"question", answer.question}, {"count", answer.count},       {"part", answer.part.number},
        {"parts", answer.part.parts},  {"scenes", std::move(scenes)}, {"sum", ToJson(Sum(answer))}};
    return written.dump(2, ' ', false, json::error_handler_t::replace) + "\n";
}

PreviewAnswer AnswerOfJson(const std::string& text) {
    PreviewAnswer answer;
    try {
        const json read = json::parse(text);
        if (read.at("version") != kVersion) throw Failure("written by another version of ovrin");
        answer.ours = CommitOf(read.at("ours"));
        answer.theirs = CommitOf(read.at("theirs"));
        answer.question = read.at("question");
        answer.count = read.at("count");
        answer.part = {read.at("part"), read.at("parts")};
        if (!answer.part.IsSound()) throw Failure("there is no such part");
        for (const json& scene : read.at("scenes")) answer.scenes.push_back(SceneOfJson(scene));
    } catch (const json::exception& error) {
        throw Failure(std::string("no answer of \"ovrin preview --json\": ") + error.what());
    }
    return answer;
}

} // namespace ovrin
