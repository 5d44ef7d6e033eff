#include "Commands/CheckCommand.h"

#include "Checks/Baseline.h"
#include "Checks/FindingLists.h"
#include "Checks/OpenConflicts.h"
#include "Checks/SceneCheck.h"
#include "Checks/ScenesToCheck.h"
#include "Commands/Output.h"
#include "Commands/Suggestion.h"
#include "Names/PrintableText.h"
#include "Scenes/InOrder.h"
#include "Scenes/SceneRules.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <CLI/CLI.hpp>
#include <iostream>
#include <memory>
#include <optional>

namespace ovrin {

using ovrin_yaml::YAMLTypeInfoManager;

namespace {

struct CheckWish {
    std::vector<std::string> files;
    bool staged = false, all = false;
    bool json = false, sarif = false;
    std::string baseline, code;
    std::string typeInfo = FormatFiles::OfEnvironment().typeInfo;
};

Outcome Explain(const std::string& name) {
    if (const CodeInfo* info = FindCode(name)) {
        PrintResult(std::string(info->name) + ": " + info->title + "\n\n" + info->explanation + '\n');
        return Outcome::Done;
    }
    std::vector<std::string> names;
    for (const CodeInfo& info : CodeTable()) names.emplace_back(info.name);
    const std::string nearest = Nearest(name, names);
    std::string known = names.front();
    for (std::size_t i = 1; i < names.size(); ++i) known += ", " + names[i];
    throw Failure("There is no code \"" + name + "\"" +
                  (nearest.empty() ? "" : "; did you mean " + nearest + "?") + "\nThe codes are " + known);
}

std::vector<SceneToCheck> ScenesOf(const CheckWish& wish, const std::optional<Repository>& repository) {
    if (!wish.files.empty()) return NamedScenes(wish.files, repository ? &*repository : nullptr);
    if (!repository || repository->top.empty())
        throw Failure("There is no working tree of git, Mercurial or Subversion around this folder; name the "
                      "scenes: ovrin check FILE...");
    if (wish.staged) return StagedScenes(*repository);
    return wish.all ? AllScenes(*repository) : ChangedScenes(*repository);
}

/// Scenes that are named can be checked without version control, which may not even be installed.
OpenConflicts ConflictsOf(const CheckWish& wish, const std::optional<Repository>& repository) {
    if (!repository || repository->top.empty()) return {};
    try {
        return OpenConflicts(*repository);
    } catch (const Failure& failure) {
        if (wish.files.empty()) throw;
        std::cerr << "ovrin: Open conflicts are not looked for: " << failure.what() << '\n';
        return {};
    }
}

/// Throws std::bad_alloc only.
CheckedScene Check(const SceneToCheck& scene, const YAMLTypeInfoManager& types,
                   const OpenConflicts& conflicts) {
    CheckedScene checked{scene.name, {}, {}};
    try {
        if (scene.take) checked.findings = CheckScene(scene.take(), types);
    } catch (const Failure& failure) {
        checked.failure = failure.what();
    }
    const bool isNoScene = checked.findings.size() == 1 && checked.findings[0].code == Code::NoScene;
    if (isNoScene && scene.mayBeOther) checked = {scene.name, {}, {}, true};
    if (auto open = conflicts.Find(scene.path)) checked.findings.insert(checked.findings.begin(), *open);
    return checked;
}

CheckedScenes CheckAll(const std::vector<SceneToCheck>& scenes, const YAMLTypeInfoManager& types,
                       const OpenConflicts& conflicts, Baseline& baseline) {
    CheckedScenes result;
    ForEachInOrder(
        scenes.size(), [&](std::size_t index) { return Check(scenes[index], types, conflicts); },
        [&](std::size_t, CheckedScene scene) {
            baseline.Accept(scene);
            if (scene.isOther)
                ++result.others;
            else if (scene.failure.empty())
                ++result.checked;
            else
                std::cerr << "ovrin: " << Printable(scene.file) << ": " << Printable(scene.failure) << '\n';
            if (!scene.findings.empty() || !scene.failure.empty()) result.scenes.push_back(std::move(scene));
        });
    result.accepted = baseline.Accepted();
    return result;
}

std::string Count(std::size_t count, const std::string& what) {
    return std::to_string(count) + ' ' + what + (count == 1 ? "" : "s");
}

/// `left`: findings of the baseline that are gone.
Outcome TellResult(const CheckedScenes& result, std::size_t left, std::size_t scenes) {
    std::size_t findings = 0;
    for (const CheckedScene& scene : result.scenes) findings += scene.findings.size();
    std::cerr << "Checked " << Count(result.checked, "scene") << ": " << Count(findings, "finding");
    if (result.accepted) std::cerr << ", and " << result.accepted << " that the baseline accepts";
    std::cerr << ".\n";
    if (result.others)
        std::cerr << "Passed over " << Count(result.others, ".meta file") << " of another form.\n";
    if (left)
        std::cerr << "Of the baseline " << Count(left, "finding")
                  << " didn't come up again: it may be made anew.\n";
    if (findings) std::cerr << "\"ovrin check --explain CODE\" tells what a finding means and its cure.\n";
    if (result.checked + result.others < scenes) return Outcome::Failed;
    return findings ? Outcome::LeftOpen : Outcome::Done;
}

Outcome RunCheck(const CheckWish& wish) {
    if (!wish.code.empty()) return Explain(wish.code);
    const std::optional<Repository> repository = FindRepository();
    const std::vector<SceneToCheck> scenes = ScenesOf(wish, repository);
    const YAMLTypeInfoManager types = ReadTypeInfo(wish.typeInfo);
    Baseline baseline = wish.baseline.empty() ? Baseline() : Baseline(wish.baseline);
    const OpenConflicts conflicts = ConflictsOf(wish, repository);
    const CheckedScenes result = CheckAll(scenes, types, conflicts, baseline);
    PrintResult(wish.sarif ? ToSarif(result) : wish.json ? ToJson(result) : ToLines(result));
    // Of a part of the scenes nobody knows.
    return TellResult(result, wish.all ? baseline.Left() : 0, scenes.size());
}

} // namespace

Action DescribeCheck(CLI::App& command) {
    const auto wish = std::make_shared<CheckWish>();
    auto* files = command.add_option(
        "FILE", wish->files, "scenes; \"-\" is standard input. Without any: those that are new or changed");
    auto* staged = command.add_flag("--staged", wish->staged, "what git's index holds for the next commit");
    auto* all = command.add_flag("--all", wish->all, "all scenes that version control keeps");
    auto* json = command.add_flag("--json", wish->json, "print the findings as JSON");
    auto* sarif = command.add_flag("--sarif", wish->sarif, "print them as SARIF 2.1.0");
    auto* baseline =
        command.add_option("--baseline", wish->baseline, "accept what this output of --json holds");
    auto* explain = command.add_option("--explain", wish->code, "tell what a code means, and the cure");
    auto* types =
        command.add_option("--typeInfo", wish->typeInfo,
                           "type information, to find missing components; by default $OVRIN_TYPE_INFO");
    baseline->type_name("FILE");
    explain->type_name("CODE");
    types->type_name("FILE");
    staged->excludes(all)->excludes(files);
    all->excludes(files);
    json->excludes(sarif);
    for (auto* option : {files, staged, all, json, sarif, baseline, types}) explain->excludes(option);
    return [wish] { return RunCheck(*wish); };
}

} // namespace ovrin
