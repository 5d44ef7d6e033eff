#include "Preview/Question.h"

#include "Preview/ScenePreview.h"
#include "Scenes/SceneFile.h"
#include "Systems/Git.h"
#include "Words/Failure.h"

#include <algorithm>

namespace ovrin {

namespace {

constexpr GitVersion kOldestGit = {2, 38}; // the first whose merge-tree merges as merge does

/// What a merge costs beside what grows with the texts, in bytes of them: reading rules, asking for blobs.
constexpr std::uint64_t kCostOfScene = 20'000;

void CheckGit() {
    const GitVersion version = InstalledGit();
    if (version.IsOlderThan(kOldestGit))
        throw Failure("A preview needs git " + kOldestGit.Text() + " or later; this is git " +
                      version.Text());
}

[[noreturn]] void FailForRevision(const Git& git, const std::string& revision) {
    const std::vector<std::string> names = RevisionNames(git);
    const auto near =
        std::ranges::find_if(names, [&](const std::string& name) { return name.ends_with("/" + revision); });
    const std::string cure =
        near != names.end()
            ? "\nDid you mean " + *near + "?"
            : ": \"git fetch\" gets what others have published, \"git branch -a\" lists branches";
    throw Failure("There is no revision \"" + revision + "\" here" + cure);
}

NamedCommit Find(const Git& git, const std::string& revision) {
    const auto commit = FindCommit(git, revision);
    if (!commit) FailForRevision(git, revision);
    return {revision, *commit};
}

bool IsScene(const UnmergedFile& file) {
    const auto isFile = [](const auto& entry) { return entry && entry->isFile; };
    return (file.isByObjects || IsSceneName(file.path)) &&
           (isFile(file.base) || isFile(file.ours) || isFile(file.theirs));
}

/// git's hash of everything that the answer comes from.
std::string HashOf(const Git& git, const PreviewQuestion& question) {
    std::string text = question.answer.ours.id + question.answer.theirs.id;
    for (const UnmergedFile& file : question.files) {
        text += '\0' + file.path + '\0';
        for (const auto* entry : {&file.base, &file.ours, &file.theirs})
            text += (*entry ? (*entry)->id : "none") + '\0';
        for (const std::string& conflict : file.conflicts) text += conflict + '\0';
        text += file.isByObjects ? "objects" : "lines";
    }
    return WithoutLineEnd(git.Output({"hash-object", "--stdin"}, std::move(text)));
}

} // namespace

std::uint64_t CostOf(const UnmergedFile& file) {
    return kCostOfScene + (IsMerged(file) ? file.Size() : 0);
}

PreviewQuestion AskFor(const Repository& repository, const std::string& revision) {
    CheckGit();
    const Git git(repository);
    PreviewQuestion question;
    PreviewAnswer& answer = question.answer;
    answer.ours = CheckedOut(git);
    answer.theirs = Find(git, revision);
    const std::vector<std::string> bases = MergeBases(git, answer.ours, answer.theirs);
    if (bases.empty())
        throw Failure(answer.ours.name + " and " + revision +
                      " have no common history: git refuses to merge them");
    question.isMergedAlready = std::ranges::find(bases, answer.theirs.id) != bases.end();
    // Where the one goes on from the other there is nothing to merge, but only git's answer is the proof.
    if (!question.isMergedAlready)
        question.files = ListUnmerged(repository, answer.ours.id, answer.theirs.id);
    std::erase_if(question.files, [](const UnmergedFile& file) { return !IsScene(file); });
    for (const UnmergedFile& file : question.files) {
        answer.scenes.push_back(PlaceScene(file, answer.ours, answer.theirs));
        answer.scenes.back().number = answer.scenes.size();
    }
    answer.count = answer.scenes.size();
    answer.question = HashOf(git, question);
    return question;
}

void Reduce(PreviewQuestion& question, const Part& part) {
    std::vector<std::uint64_t> costs;
    for (const UnmergedFile& file : question.files) costs.push_back(CostOf(file));
    const std::vector<std::size_t> partOf = ShareOut(costs, part.parts);
    PreviewQuestion all = std::move(question);
    question = {all.answer, {}, all.isMergedAlready};
    question.answer.part = part;
    question.answer.scenes.clear();
    for (std::size_t i = 0; i < partOf.size(); ++i) {
        if (partOf[i] + 1 != part.number) continue;
        question.answer.scenes.push_back(std::move(all.answer.scenes[i]));
        question.files.push_back(std::move(all.files[i]));
    }
}

} // namespace ovrin
