#include "Commands/PreviewCommand.h"

#include "Commands/Output.h"
#include "FileUtils.h"
#include "Preview/AnswerMarkdown.h"
#include "Preview/AnswerText.h"
#include "Preview/Join.h"
#include "Preview/LookIntoAll.h"
#include "Preview/Question.h"
#include "Scenes/SceneRules.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"
#include "Words/ProgressCount.h"

#include <CLI/CLI.hpp>
#include <iostream>
#include <memory>

namespace ovrin {

namespace {

struct Wish {
    std::string revision;
    std::string part;
    std::vector<std::string> files; // to join
    bool isJson = false, isMarkdown = false;
};

Repository FindGitRepository() {
    const auto repository = FindRepository();
    if (!repository) throw Failure("There is no git repository here");
    if (repository->kind != SystemKind::Git)
        throw Failure("A preview needs git: " +
                      std::string(repository->kind == SystemKind::Mercurial ? "Mercurial" : "Subversion") +
                      " can't tell what a merge would meet without making it");
    return *repository;
}

PreviewAnswer Preview(const Wish& wish) {
    const Part part = wish.part.empty() ? Part() : ParsePart(wish.part);
    const Repository repository = FindGitRepository();
    const SceneRules rules = ReadSceneRules(FormatFiles::OfEnvironment());
    PreviewQuestion question = AskFor(repository, wish.revision);
    if (question.isMergedAlready)
        std::cerr << "Nothing to do: " << wish.revision << " is merged into " << question.answer.ours.name
                  << " already.\n";
    Reduce(question, part);
    ProgressCount progress;
    LookIntoAll(question, repository, rules, [&](std::size_t done, std::size_t all) {
        progress.Tell("Merging scenes: " + std::to_string(done) + " of " + std::to_string(all));
    });
    return std::move(question.answer);
}

PreviewAnswer JoinFiles(const std::vector<std::string>& names) {
    std::vector<AnswerFile> files;
    for (const std::string& name : names) {
        std::string text;
        if (ReadWholeFile(name, text) != ReadResult::Complete) throw Failure("Cannot read " + name);
        try {
            files.push_back({name, AnswerOfJson(text)});
        } catch (const Failure& failure) {
            throw Failure(name + " can't be joined: " + failure.what());
        }
    }
    return Join(std::move(files));
}

/// What isn't known must not look like a merge without conflicts, and neither must a merge by lines.
Outcome OutcomeOf(const PreviewAnswer& answer) {
    const ScenesInSum sum = Sum(answer);
    if (sum.unknown) return Outcome::Failed;
    return sum.conflicting || sum.byLines ? Outcome::LeftOpen : Outcome::Done;
}

Outcome Run(const Wish& wish) {
    if (wish.revision.empty() == wish.files.empty())
        throw Failure("Name the branch that would be merged, or with --join the files to put together");
    const PreviewAnswer answer = wish.files.empty() ? Preview(wish) : JoinFiles(wish.files);
    PrintResult(wish.isJson ? ToJson(answer) : wish.isMarkdown ? ToMarkdown(answer) : ToText(answer));
    if (const std::string words = ByLinesWords(answer); !words.empty()) std::cerr << words << ".\n";
    return OutcomeOf(answer);
}

} // namespace

Action DescribePreview(CLI::App& command) {
    const auto wish = std::make_shared<Wish>();
    command.add_option("BRANCH", wish->revision,
                       "what would be merged into what is checked out: any revision");
    auto* part =
        command.add_option("--part", wish->part, "look into part K of N alone, a job's share of the scenes");
    part->type_name("K/N");
    command.add_option("--join", wish->files, "put the answers of all parts together, which are JSON")
        ->type_name("FILE")
        ->excludes(part);
    auto* json = command.add_flag("--json", wish->isJson, "answer in JSON");
    command.add_flag("--markdown", wish->isMarkdown, "answer as a comment on a pull request")->excludes(json);
    return [wish] { return Run(*wish); };
}

} // namespace ovrin
