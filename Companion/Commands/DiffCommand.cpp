#include "Commands/DiffCommand.h"

#include "Commands/DiffArguments.h"
#include "Commands/DiffOutput.h"
#include "Commands/DiffVersions.h"
#include "Scenes/SceneRules.h"

#include <CLI/CLI.hpp>
#include <memory>

namespace ovrin {

namespace {

struct DiffWish {
    DiffOperands operands;
    DiffLook look;
    ChangeWish values;
    bool isWhole = false;
    bool isExternal = false;
    bool tellsByStatus = false;
};

/// Characters of a value in a line for people.
constexpr std::size_t kValueWidth = 100;

Outcome RunDiff(const DiffWish& wish) {
    ChangeWish values = wish.values;
    values.width = wish.isWhole || wish.look.form == DiffForm::Json ? 0 : kValueWidth;
    const ChangedFiles changes =
        wish.isExternal ? VersionsForGit(wish.operands) : VersionsToCompare(wish.operands);
    const SceneRules rules = ReadSceneRules(FormatFiles::OfEnvironment());
    OutputChanges(changes, rules.rules, values, wish.look);
    // Whoever calls for a single file takes any other status for a failure.
    return wish.tellsByStatus && !wish.isExternal && !changes.files.empty() ? Outcome::LeftOpen
                                                                            : Outcome::Done;
}

void DescribeLook(CLI::App& command, const std::shared_ptr<DiffWish>& wish) {
    DiffLook& look = wish->look;
    const auto form = [&](const char* name, DiffForm value, const char* text) {
        return command.add_flag_callback(
            name, [wish, value] { wish->look.form = value; }, text);
    };
    auto* stat = form("--stat", DiffForm::Stat, "only count the objects of each scene");
    auto* markdown = form("--markdown", DiffForm::Markdown, "write Markdown, for a pull request");
    auto* json = form("--json", DiffForm::Json, "write JSON, for a script");
    markdown->excludes(stat);
    json->excludes(stat)->excludes(markdown);
    command.add_option("--color", look.colour, "whether to colour; auto: on a terminal")
        ->check(CLI::IsMember({"auto", "always", "never"}))
        ->capture_default_str();
    command.add_flag("--no-pager{false}", look.mayPage, "write to the terminal itself");
    command.add_flag("--full", wish->isWhole, "shorten no value");
    command.add_flag("--values", wish->values.withValues, "tell the fields of added and removed objects too");
}

} // namespace

Action DescribeDiff(CLI::App& command) {
    const auto wish = std::make_shared<DiffWish>();
    AddDiffOperands(command, wish->operands,
                    "none: the working tree; one: against the working tree; two, or A..B, A...B: against "
                    "each other; or two files");
    DescribeLook(command, wish);
    command.add_flag("--exit-code", wish->tellsByStatus, "end with status 1 if anything differs");
    command.add_flag("--external", wish->isExternal,
                     "serve git as its external diff: \"ovrin diff --external --\" as diff.ovrin.command");
    return [wish] { return RunDiff(*wish); };
}

} // namespace ovrin
