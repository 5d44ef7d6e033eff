#include "Commands/SetupCommand.h"

#include "Commands/Output.h"
#include "Setup/SetupRun.h"

#include <CLI/CLI.hpp>
#include <iostream>
#include <memory>

namespace ovrin {

namespace {

Outcome RunWish(const SetupWish& wish) {
    if (wish.isDryRun) std::cerr << "A dry run: nothing is written.\n";
    const SetupReport report = RunSetup(wish);
    PrintResult(report.done);
    std::cerr << report.words;
    if (report.failures == 0) return Outcome::Done;
    return report.done.empty() ? Outcome::Failed : Outcome::LeftOpen;
}

} // namespace

Action DescribeSetup(CLI::App& command) {
    const auto wish = std::make_shared<SetupWish>();
    command.add_option("SYSTEM", wish->system, "git, hg or svn; all that are installed otherwise")
        ->check(CLI::IsMember({"git", "hg", "svn"}));
    auto* local = command.add_flag_callback(
        "--local", [wish] { wish->scope = Scope::Local; }, "set up the repository around this folder alone");
    command
        .add_flag_callback(
            "--global", [wish] { wish->scope = Scope::Global; },
            "set up everything of this user, as is done anyhow")
        ->excludes(local);
    command.add_flag("--undo", wish->isUndo, "take out again what was written");
    command.add_flag("--dry-run", wish->isDryRun, "tell what would be done, and write nothing");
    command.add_option("--program", wish->program, "how ovrin is to be called: a name or a path")
        ->type_name("NAME");
    return [wish] { return RunWish(*wish); };
}

} // namespace ovrin
