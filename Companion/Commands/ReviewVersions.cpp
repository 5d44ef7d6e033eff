#include "Commands/ReviewVersions.h"

#include "Changes/ScenePair.h"
#include "FileUtils.h"
#include "Names/PrintableText.h"
#include "Scenes/SceneFile.h"
#include "Systems/BlobReader.h"
#include "Systems/Git.h"
#include "Systems/GitFiles.h"
#include "Systems/GitHistory.h"
#include "Systems/MergeTree.h"
#include "Systems/Repository.h"
#include "Systems/WorkingPath.h"
#include "Words/Failure.h"

#include "Reading/DocumentCut.h"

#include <algorithm>
#include <filesystem>
#include <memory>
#include <sstream>

namespace ovrin {

namespace {

bool AreThreeFiles(const DiffOperands& operands) {
    const bool isAlone = operands.paths.empty() && !operands.isStaged;
    return isAlone && operands.words.size() == 3 &&
           std::ranges::all_of(operands.words, [](const std::string& word) {
               std::error_code error;
               return std::filesystem::is_regular_file(word, error);
           });
}

std::optional<ThreeTexts> TextsOfPair(const ChangedFile& changed) {
    if (changed.file.status == FileStatus::Unmerged && IsSceneName(changed.file.newPath))
        throw Failure("It isn't merged yet: \"ovrin settle\" shows what is open");
    ScenePair pair = ReadScenePair(changed);
    if (!pair.reason.empty()) throw Failure(pair.reason);
    if (!pair.isScene) return std::nullopt;
    return ThreeTexts{pair.before, pair.before, std::move(pair.after)};
}

/// Throws Failure for what isn't the text of a scene.
std::string Checked(std::string text, const std::string& name) {
    const SceneKind kind = ClassifyScene(text);
    if (kind != SceneKind::Scene) throw Failure(TellKind(name, kind));
    return text;
}

std::string TextOfFile(const std::string& path) {
    std::string text;
    if (ReadWholeFile(path, text) != ReadResult::Complete) throw Failure("Cannot read " + Printable(path));
    return Checked(std::move(text), Printable(path));
}

ReviewSources ThreeFiles(const std::vector<std::string>& files) {
    const auto read = [files] {
        return std::optional(ThreeTexts{TextOfFile(files[0]), TextOfFile(files[1]), TextOfFile(files[2])});
    };
    ReviewSources sources;
    sources.isMerge = true;
    sources.files.push_back({files[1], {files[0], files[1], files[2]}, read});
    return sources;
}

/// The sides of a merge commit.
struct MergeSides {
    NamedCommit ours, theirs;
    std::string base; ///< the common ancestors, as people write them
};

MergeSides FindSides(const Git& git, const std::string& revision) {
    const auto commit = FindCommit(git, revision);
    if (!commit) throw Failure("\"" + revision + "\" is no commit");
    std::istringstream parents(git.Output({"rev-list", "--parents", "-n", "1", *commit}));
    std::string itself, ours, theirs, third;
    parents >> itself >> ours >> theirs >> third;
    if (theirs.empty() || !third.empty())
        throw Failure(Printable(revision) + " is no merge of two sides: \"ovrin review " +
                      Printable(revision) + "^ " + Printable(revision) + "\" shows what it changed");
    MergeSides sides{{git.NameOfCommit(ours), ours}, {git.NameOfCommit(theirs), theirs}, ""};
    for (const std::string& base : MergeBases(git, sides.ours, sides.theirs))
        sides.base += (sides.base.empty() ? "" : ", ") + ShortCommit(base);
    return sides;
}

std::optional<ThreeTexts> TextsOfMerge(BlobReader& blobs, const UnmergedFile& file) {
    const std::string path = Printable(file.path);
    const auto isMissing = [](const std::optional<TreeEntry>& entry) { return !entry || !entry->isFile; };
    if (isMissing(file.ours) || isMissing(file.theirs)) {
        if (!IsSceneName(file.path)) return std::nullopt;
        throw Failure("One side removed it, or made something else of it than a file");
    }
    const auto isScene = [&file](std::string_view beginning) {
        return IsSceneName(file.path) || ovrin_yaml::HasSignature(beginning);
    };
    std::optional<std::string> ours = blobs.ReadIf(file.ours->id, isScene);
    std::optional<std::string> theirs = ours ? blobs.ReadIf(file.theirs->id, isScene) : std::nullopt;
    if (!ours || !theirs) return std::nullopt;
    // An empty blob may be one that only git's merge of several bases knows.
    const bool hasBase = file.base && file.base->isFile && file.base->size > 0;
    return ThreeTexts{hasBase ? Checked(blobs.Read(file.base->id), path + " of their common history") : "",
                      Checked(std::move(*ours), path + " of ours"),
                      Checked(std::move(*theirs), path + " of theirs")};
}

bool IsMeant(const std::string& path, const std::vector<std::string>& places) {
    return places.empty() ||
           std::ranges::any_of(places, [&](const std::string& place) { return IsAtOrBelow(path, place); });
}

} // namespace

ReviewSources VersionsToReview(DiffOperands operands) {
    if (AreThreeFiles(operands)) return ThreeFiles(operands.words);
    operands.otherwise = "HEAD";
    ChangedFiles changes = VersionsToCompare(operands);
    ReviewSources sources;
    const SideLabels labels{changes.before, changes.before, changes.after};
    for (ChangedFile& changed : changes.files) {
        const std::string path = changed.file.newPath;
        sources.files.push_back(
            {path, labels, [changed = std::move(changed)] { return TextsOfPair(changed); }});
    }
    return sources;
}

ReviewSources SidesOfMerge(const std::string& revision, const std::vector<std::string>& paths) {
    const auto repository = FindRepository();
    if (!repository || repository->kind != SystemKind::Git)
        throw Failure("--merge is for git: there is no repository of it here");
    const Git git(*repository);
    const MergeSides sides = FindSides(git, revision);
    std::vector<std::string> places;
    places.reserve(paths.size());
    for (const std::string& path : paths) places.push_back(WorkingPath(*repository, path));
    ReviewSources sources;
    sources.isMerge = true;
    sources.sides = "ours is " + Printable(sides.ours.name) + ", theirs is " + Printable(sides.theirs.name) +
                    "; the result is the merge of both, whatever was committed";
    const auto blobs = std::make_shared<BlobReader>(git.Setting());
    for (UnmergedFile& file : ListUnmerged(*repository, sides.ours.id, sides.theirs.id)) {
        if (!IsMeant(file.path, places)) continue;
        const std::string path = file.path;
        sources.files.push_back({path,
                                 {sides.base, sides.ours.name, sides.theirs.name},
                                 [blobs, file = std::move(file)] { return TextsOfMerge(*blobs, file); }});
    }
    if (sources.files.empty() && !places.empty())
        throw Failure("Both sides of the merge changed nothing at " + Printable(paths.front()));
    return sources;
}

} // namespace ovrin
