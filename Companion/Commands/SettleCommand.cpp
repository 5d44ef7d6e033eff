#include "Commands/SettleCommand.h"

#include "Commands/Output.h"
#include "Commands/SettleInBrowser.h"
#include "Conflicts/ConflictReport.h"
#include "Names/PrintableText.h"
#include "Settle/ExternalTool.h"
#include "Settle/SceneWords.h"
#include "Settle/SettleScenes.h"
#include "Settle/Steps.h"
#include "Settle/Terminal/SettleInTerminal.h"
#include "Settle/Wanted.h"
#include "Systems/WorkingPath.h"
#include "Words/Failure.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <iostream>
#include <memory>
#include <nlohmann/json.hpp>

namespace ovrin {

namespace {

using nlohmann::json;

constexpr const char* kProposed = "proposed";
constexpr std::size_t kMostTold = 4; // decisions on one line

struct SettleOptions {
    std::vector<std::string> files;
    std::vector<std::string> set;
    std::string take, under, decisionFile;
    bool isList = false, asJson = false, isUndo = false, isAsIs = false, isForget = false;
    bool overwrites = false, withTool = false, withPrompts = false;
    bool inBrowser = false, isBrowserLeft = false;
    int port = 0;

    bool Decides() const { return !set.empty() || !decisionFile.empty() || !take.empty() || isUndo; }
};

void Tell(const Remarks& remarks) {
    for (const std::string& remark : remarks) std::cerr << "ovrin: " << remark << '\n';
}

void TellNext(const SettleScenes& scenes, const std::string& action) {
    for (const std::string& step : NextSteps(scenes.Where(), action)) std::cerr << step << '\n';
}

Outcome List(const SettleScenes& scenes, bool asJson) {
    std::string text;
    json all = json::array();
    bool isAnyOpen = false;
    for (const auto& session : scenes.Sessions()) {
        isAnyOpen = isAnyOpen || !session->IsSettled();
        if (asJson)
            all.push_back(ToJson(*session));
        else
            text += TellCount(SceneCount::Of(*session)) + "\n\n" + TellConflicts(*session) + '\n';
    }
    for (const SceneCount& scene : scenes.Unreadable()) {
        all.push_back(ToJson(scene));
        all.back()["conflicts"] = all.back()["problems"] = json::array();
        isAnyOpen = true;
    }
    if (asJson) text = json{{"scenes", all}}.dump(2, ' ', false, json::error_handler_t::replace) + "\n";
    PrintResult(text.empty() && !isAnyOpen ? "No scene has open conflicts.\n" : text);
    return isAnyOpen ? Outcome::LeftOpen : Outcome::Done;
}

/// Makes the steps that are asked for, all of them or none.
void Decide(const SettleScenes& scenes, const SettleOptions& options) {
    BeginStep(scenes.Sessions());
    std::vector<Wanted> wanted;
    for (const std::string& text : options.set) wanted.push_back(ParseWanted(text));
    if (!wanted.empty()) DecideWanted(scenes.Sessions(), wanted);
    if (!options.decisionFile.empty()) DecideByFile(scenes.Sessions(), options.decisionFile);
    if (options.take == kProposed)
        TakeProposed(scenes.Sessions(), options.under);
    else if (!options.take.empty())
        TakeSide(scenes.Sessions(), SideNamed(options.take), options.under);
    if (!options.isUndo) return;
    if (!UndoStep(scenes.Sessions())) throw Failure("There is no decision to take back");
}

/// What is wrong, and the decisions that would mend it.
void TellProblems(const SettleSession& session) {
    const std::string scene = Printable(session.Source().path);
    for (const Problem& problem : session.Problems()) {
        std::cerr << "ovrin: " << scene << ": " << problem.text << '\n';
        for (const Remedy& remedy : problem.remedies) {
            std::cerr << "    to " << remedy.text << ": ovrin settle";
            if (remedy.decisions.size() > kMostTold) {
                std::cerr << " --set, " << remedy.decisions.size() << " times as --list --json tells\n";
                continue;
            }
            for (const Decision& decision : remedy.decisions)
                std::cerr << " --set '" << Printable(decision.path) << '=' << SideName(decision.side) << "'";
            std::cerr << '\n';
        }
    }
}

void TellProposed(const SettleScenes& scenes) {
    std::size_t count = 0;
    for (const auto& session : scenes.Sessions()) count += session->CountProposed();
    if (count)
        std::cerr << CountOpen(count) << (count == 1 ? " was" : " were")
                  << " decided before: \"ovrin settle --take proposed\" takes the same sides.\n";
}

/// Tells of the sessions that stay, and of what is missing in those that go.
bool TellOpen(const SettleScenes& scenes, bool wasDecided) {
    bool isAnyOpen = false;
    for (const auto& session : scenes.Sessions()) {
        TellProblems(*session);
        if (session->IsSettled()) continue;
        isAnyOpen = true;
        std::cerr << TellCount(SceneCount::Of(*session)) << '\n';
        if (session->Open().empty())
            std::cerr << "Both sides added the scene: look through the union of the two, and take it with "
                         "\"ovrin settle --take ours\" or, changed by you, with \"ovrin settle --as-is\".\n";
    }
    TellProposed(scenes);
    if (isAnyOpen)
        std::cerr << (wasDecided ? "The decisions are kept. " : "")
                  << "\"ovrin settle --list\" shows what is open.\n";
    return isAnyOpen;
}

void TellFinished(const SettleScenes& scenes, const std::vector<std::string>& finished,
                  const Remarks& refused) {
    for (const std::string& path : finished) std::cerr << Printable(path) << " is settled.\n";
    Tell(refused);
    if (!finished.empty()) TellNext(scenes, scenes.Sessions().front()->Source().occasion.action);
}

Outcome Settle(SettleScenes& scenes, const SettleOptions& options, bool isAnyUnreadable) {
    if (isAnyUnreadable && scenes.Sessions().empty()) return Outcome::LeftOpen;
    Decide(scenes, options);
    if (options.Decides())
        for (const auto& session : scenes.Sessions()) scenes.Keep(*session);
    const bool isAnyOpen = TellOpen(scenes, options.Decides());
    Remarks refused;
    const std::vector<std::string> finished = scenes.Finish(options.overwrites, refused);
    TellFinished(scenes, finished, refused);
    if (finished.empty() && !isAnyOpen && refused.empty() && !isAnyUnreadable)
        std::cerr << "No scene has open conflicts.\n";
    const bool isAllFinished = finished.size() == scenes.Sessions().size();
    return isAnyUnreadable || !isAllFinished ? Outcome::LeftOpen : Outcome::Done;
}

/// Lets a person do it, as far as that person likes.
Outcome LetPersonSettle(SettleScenes& scenes, const SettleOptions& options, bool isAnyUnreadable) {
    SettleDesk desk(scenes);
    const TerminalEnd end = SettleInTerminal(desk, options.withPrompts);
    TellFinished(scenes, end.finished, end.refused);
    const std::size_t left = scenes.Sessions().size() - end.finished.size();
    if (left > 0 && end.refused.empty())
        std::cerr << (desk.IsSettled()   ? "All is settled"
                      : desk.CountOpen() ? CountOpen(desk.CountOpen()) + " left"
                                         : "A scene that both sides added waits for a look")
                  << ", and what you decided is kept: \"ovrin settle\" goes on.\n";
    return left > 0 || isAnyUnreadable ? Outcome::LeftOpen : Outcome::Done;
}

/// Takes files as they stand, or forgets that they had conflicts.
Outcome SetAside(SettleScenes& scenes, const SettleOptions& options) {
    if (options.files.empty())
        throw Failure(std::string(options.isAsIs ? "--as-is" : "--forget") +
                      " wants the files that are meant");
    const std::vector<std::string> paths = scenes.Paths();
    if (options.isAsIs)
        scenes.TakeAsTheyStand();
    else
        scenes.Forget();
    for (const std::string& path : paths)
        std::cerr << Printable(path)
                  << (options.isAsIs ? " is settled as it stands.\n" : " is forgotten, and is as it was.\n");
    TellNext(scenes, "");
    return Outcome::Done;
}

Outcome RunTool(const std::vector<std::string>& files) {
    if (files.size() != 4) throw Failure("--with-tool wants four files: BASE OURS THEIRS RESULT");
    MergeWithTool({files[0], files[1], files[2], files[3]});
    ForgetSettledFile(files[3]);
    return Outcome::Done;
}

Outcome RunSettle(const SettleOptions& options) {
    if (options.withTool) return RunTool(options.files);
    Remarks remarks;
    SettleScenes scenes(remarks);
    Tell(remarks);
    scenes.LimitTo(options.files);
    if (options.isAsIs || options.isForget) return SetAside(scenes, options);
    Remarks unreadable;
    const bool isAnyUnreadable = scenes.Open(unreadable) > 0;
    Tell(unreadable);
    if (options.isList) return List(scenes, options.asJson);
    if (options.inBrowser) return SettleInBrowser(scenes, {options.port, !options.isBrowserLeft});
    const bool isForPerson =
        options.withPrompts || (IsPersonThere() && !options.Decides() && !options.overwrites);
    if (isForPerson && !scenes.Sessions().empty()) return LetPersonSettle(scenes, options, isAnyUnreadable);
    return Settle(scenes, options, isAnyUnreadable);
}

void DescribeDecisions(CLI::App& command, SettleOptions& options) {
    command
        .add_option(
            "--set", options.set,
            "take a side at a conflict: PATH=ours, PATH=theirs or PATH=base, where PATH is what --list "
            "shows, a pattern with * for any one element, or the name of the object and the property")
        ->type_name("PATH=SIDE")
        ->allow_extra_args(false);
    auto* take = command
                     .add_option("--take", options.take,
                                 "take a side at all open conflicts; proposed: at each what was decided when "
                                 "the same one was met before")
                     ->check(CLI::IsMember({"ours", "theirs", "base", kProposed}))
                     ->type_name("SIDE");
    command.add_option("--under", options.under, "only at those of this object and what stands under it")
        ->needs(take)
        ->type_name("NAME");
    command
        .add_option("-i,--decisions", options.decisionFile,
                    "make the decisions of a file, in the form that OvrinMerge reads")
        ->type_name("FILE");
    command.add_flag("--undo", options.isUndo, "take the last decisions back");
}

void DescribeBrowser(CLI::App& command, SettleOptions& options) {
    auto* web = command.add_flag("--web", options.inBrowser, "settle on a page in the browser");
    command
        .add_option("--port", options.port, "serve the page on this port of 127.0.0.1, not on any free one")
        ->check(CLI::Range(1024, 65535))
        ->type_name("PORT")
        ->needs(web);
    command
        .add_flag("--no-browser", options.isBrowserLeft, "tell the address of the page, and open no browser")
        ->needs(web);
    for (const char* other :
         {"--list", "--set", "--take", "--decisions", "--undo", "--as-is", "--forget", "--with-tool"})
        web->excludes(command.get_option(other));
}

} // namespace

Action DescribeSettle(CLI::App& command) {
    const auto options = std::make_shared<SettleOptions>();
    DescribeDecisions(command, *options);
    auto* list = command.add_flag("--list", options->isList, "show the conflicts, and decide nothing");
    command.add_flag("--json", options->asJson, "in a form for programs")->needs(list);
    auto* asIs = command.add_flag("--as-is", options->isAsIs, "take the files as they stand");
    command.add_flag("--forget", options->isForget, "forget the conflicts of the files, and touch nothing")
        ->excludes(asIs);
    command.add_flag("--overwrite", options->overwrites,
                     "put the settled scene in the place of a file that was changed by hand");
    command.add_flag("--prompt", options->withPrompts,
                     "ask line by line instead of on a screen, also where there is no terminal");
    command.add_flag(
        "--with-tool", options->withTool,
        "let the external merge tool settle BASE OURS THEIRS RESULT, as git mergetool calls it for "
        "ovrin-external");
    DescribeBrowser(command, *options);
    command.add_option("FILE", options->files, "only these scenes, or those in these folders");
    return [options] { return RunSettle(*options); };
}

} // namespace ovrin
