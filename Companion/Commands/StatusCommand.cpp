#include "Commands/StatusCommand.h"

#include "Commands/Output.h"
#include "Conflicts/LiveMerges.h"
#include "Conflicts/OpenMerges.h"
#include "Settle/SceneCount.h"
#include "Settle/SettleScenes.h"
#include "Systems/Git.h"
#include "Systems/Operation.h"
#include "Systems/Repository.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <iostream>
#include <memory>
#include <nlohmann/json.hpp>

namespace ovrin {

namespace {

using nlohmann::json;

struct StatusOptions {
    bool asJson = false;
    bool isGuard = false;
    bool inRebaseAlone = false;
};

constexpr const char* kWaysOut =
    "What to do:\n"
    "  ovrin settle                   settles the conflicts here; with --web in the browser\n"
    "  ovrin settle --list            shows them, by the names of objects\n"
    "  ovrin settle --take ours       settles all that are open; or theirs, or base\n"
    "  ovrin settle --as-is FILE      you settled it in the editor: takes the file as it stands\n"
    "  ovrin settle --forget FILE     forgets that there were conflicts, and touches nothing\n";
constexpr const char* kWayPastTheHook = "  git commit --no-verify         commits it as it is\n";

/// Of the live merges those that the commit would take along without their being settled.
std::vector<OpenMerge> FindUnsettled(const Repository& repository, std::vector<OpenMerge> live) {
    if (repository.kind != SystemKind::Git || live.empty()) return live;
    // What concludes an operation concludes it for all files. Any other commit takes some.
    if (!OperationIn(repository).action.empty()) return live;
    std::vector<std::string> paths(live.size());
    std::ranges::transform(live, paths.begin(), &OpenMerge::path);
    const std::vector<std::string> committed = Git(repository).DifferingFromHead(paths, true);
    std::erase_if(live, [&](const OpenMerge& merge) {
        return std::ranges::find(committed, merge.path) == committed.end();
    });
    return live;
}

/// Whether git is in what it commits for by itself, without the hook that other commits pass.
bool CommitsByItself(const Repository& repository) {
    const std::string action = OperationIn(repository).action;
    return action == "rebase" || action == "am";
}

Outcome Guard(bool inRebaseAlone) {
    const std::optional<Repository> repository = FindRepository();
    if (!repository || repository->top.empty()) return Outcome::Done;
    if (inRebaseAlone && !CommitsByItself(*repository)) return Outcome::Done;
    const OpenMerges store(*repository);
    if (store.List().empty()) return Outcome::Done; // nearly always, and without starting git
    const std::vector<OpenMerge> unsettled =
        FindUnsettled(*repository, FindLiveMerges(*repository, store).live);
    if (unsettled.empty()) return Outcome::Done;
    std::string text = "ovrin: this commit would hold scenes whose conflicts aren't settled:\n";
    for (const OpenMerge& merge : unsettled)
        text += "  " + TellCount(SceneCount::Of(merge, store.ProgressOf(merge))) + '\n';
    std::cerr << text << kWaysOut << (inRebaseAlone ? "" : kWayPastTheHook);
    return Outcome::LeftOpen;
}

Outcome Status(bool asJson) {
    Remarks remarks;
    const SettleScenes scenes(remarks);
    for (const std::string& remark : remarks) std::cerr << "ovrin: " << remark << '\n';
    const std::vector<SceneCount> counts = scenes.Count();
    if (asJson) {
        json all = json::array();
        for (const SceneCount& count : counts) all.push_back(ToJson(count));
        PrintResult(json{{"scenes", all}}.dump(2, ' ', false, json::error_handler_t::replace) + "\n");
    } else {
        std::string text;
        for (const SceneCount& count : counts) text += TellCount(count) + '\n';
        PrintResult(counts.empty() ? "No scene has open conflicts.\n" : text);
        if (!counts.empty())
            std::cerr << "\"ovrin settle\" settles what is open, \"ovrin settle --web\" does so in the "
                         "browser, and "
                         "\"ovrin settle --take ours\" (or theirs, or base) without a look.\n";
    }
    return counts.empty() ? Outcome::Done : Outcome::LeftOpen;
}

} // namespace

Action DescribeStatus(CLI::App& command) {
    const auto options = std::make_shared<StatusOptions>();
    auto* json = command.add_flag("--json", options->asJson, "tell it in a form for programs");
    auto* guard = command
                      .add_flag("--guard", options->isGuard,
                                "for git's hooks: refuse a commit of scenes whose conflicts aren't settled")
                      ->excludes(json);
    command
        .add_flag("--in-rebase", options->inRebaseAlone,
                  "with --guard: only where git commits by itself, in a rebase or an application of patches")
        ->needs(guard);
    return [options] { return options->isGuard ? Guard(options->inRebaseAlone) : Status(options->asJson); };
}

} // namespace ovrin
