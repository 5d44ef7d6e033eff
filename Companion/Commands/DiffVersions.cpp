#include "Commands/DiffVersions.h"

#include "Systems/GitChanges.h"
#include "Systems/OtherChanges.h"
#include "Systems/Process.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <algorithm>
#include <filesystem>

namespace ovrin {

namespace {

constexpr const char* kNothing = "/dev/null";

bool IsThere(const std::string& path) {
    std::error_code error;
    return std::filesystem::exists(path, error);
}

bool IsFolder(const std::string& path) {
    std::error_code error;
    return std::filesystem::is_directory(path, error);
}

FileVersion VersionAt(const std::string& path) {
    return path == kNothing ? nullptr : VersionOnDisk(path);
}

std::string DiffOfFiles(const FilePair& shown, const std::string& before, const std::string& after) {
    const auto label = [](const std::string& path, const std::string& file, const char* side) {
        return file == kNothing ? file : side + path;
    };
    const ProcessResult result = RunProcess({"diff", "-u", "-L", label(shown.oldPath, before, "a/"), "-L",
                                             label(shown.newPath, after, "b/"), "--", before, after});
    if (result.status > 1) throw Failure("\"diff\" failed: " + result.errors);
    return result.output;
}

/// Two files, shown under other names.
ChangedFiles TwoFiles(FilePair shown, const std::string& before, const std::string& after) {
    if (before == kNothing) shown.status = FileStatus::Added;
    if (after == kNothing) shown.status = FileStatus::Removed;
    ChangedFiles changes;
    changes.before = before;
    changes.after = after;
    changes.files.push_back({shown, VersionAt(before), VersionAt(after)});
    changes.lines = [before, after](std::span<const FilePair> files) {
        return files.empty() ? "" : DiffOfFiles(files.front(), before, after);
    };
    return changes;
}

/// git knows its revisions; for the others a word is one if it is no file.
bool MayBeRevision(const Repository& repository, const std::string& word) {
    return repository.kind == SystemKind::Git ? IsGitRevision(word) : !IsThere(word);
}

ChangedFiles CompareTwoFiles(const std::string& before, const std::string& after) {
    for (const std::string& path : {before, after})
        if (IsFolder(path)) throw Failure(path + " is a folder: name two files");
    std::string left, right;
    const FileVersion versions[] = {VersionAt(before), VersionAt(after)};
    const auto bytes = [](const FileVersion& version) {
        return version ? version([](std::string_view) { return true; }) : std::nullopt;
    };
    if (bytes(versions[0]) == bytes(versions[1])) return {};
    const std::string& name = after == kNothing ? before : after;
    return TwoFiles({FileStatus::Changed, before == kNothing ? name : before, name}, before, after);
}

[[noreturn]] void FailForBoth(const std::string& word) {
    throw Failure("\"" + word + "\" is a revision and a file: write \"-- " + word + "\" for the file");
}

/// Revisions go in front of paths. What may be either must be marked.
ComparisonWish Sorted(const DiffOperands& operands, const Repository& repository) {
    ComparisonWish wish{{}, operands.paths, operands.isStaged};
    bool areRevisions = true;
    for (const std::string& word : operands.words) {
        const bool areMarked = !operands.paths.empty();
        areRevisions = areMarked || (areRevisions && MayBeRevision(repository, word));
        const bool mayBeFile = !repository.top.empty() && IsThere(word);
        if (areRevisions && !areMarked && mayBeFile) FailForBoth(word);
        (areRevisions ? wish.revisions : wish.paths).push_back(word);
    }
    const bool hasDefault = !operands.otherwise.empty() && repository.kind == SystemKind::Git;
    // What is to be committed is compared with the last commit anyway, and with nothing ahead of the first.
    if (wish.revisions.empty() && hasDefault && !operands.isStaged) {
        if (!IsGitRevision(operands.otherwise))
            throw Failure("There is no commit here yet to compare with: --staged takes what is to become the "
                          "first one");
        wish.revisions.push_back(operands.otherwise);
    }
    return wish;
}

} // namespace

ChangedFiles VersionsToCompare(const DiffOperands& operands) {
    const std::vector<std::string>& words = operands.words;
    const std::optional<Repository> repository = FindRepository();
    const auto isFileAlone = [&](const std::string& word) {
        return IsThere(word) && !(repository && MayBeRevision(*repository, word));
    };
    const bool areFiles = words.size() == 2 && operands.paths.empty() && !operands.isStaged;
    if (areFiles && std::ranges::all_of(words, isFileAlone)) return CompareTwoFiles(words[0], words[1]);
    if (!repository)
        throw Failure(
            "There is no git, Mercurial or Subversion here: name two files, \"ovrin diff OLD NEW\"");
    const ComparisonWish wish = Sorted(operands, *repository);
    return repository->kind == SystemKind::Git ? ListGitChanges(*repository, wish)
                                               : ListOtherChanges(*repository, wish);
}

ChangedFiles VersionsForGit(const DiffOperands& operands) {
    std::vector<std::string> words = operands.words;
    words.insert(words.end(), operands.paths.begin(), operands.paths.end());
    if (words.size() == 1) {
        ChangedFiles changes;
        changes.files.push_back({{FileStatus::Unmerged, words[0], words[0]}, nullptr, nullptr});
        return changes;
    }
    if (words.size() != 7 && words.size() != 8 && words.size() != 9)
        throw Failure(
            "--external is for git, which gives seven operands or more: path, old file, its id and mode, new "
            "file, its id and mode");
    const bool isRenamed = words.size() > 7;
    return TwoFiles(
        {isRenamed ? FileStatus::Renamed : FileStatus::Changed, words[0], isRenamed ? words[7] : words[0]},
        words[1], words[4]);
}

} // namespace ovrin
