#include "Conflicts/UnrecordedMerge.h"

#include "Systems/Git.h"
#include "Systems/Operation.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <array>

namespace ovrin {

namespace {

/// The blobs of a path by their stages; empty for what isn't there.
std::array<std::string, 4> StagesOf(const Git& git, const std::string& path) {
    std::array<std::string, 4> objects;
    for (GitEntry& entry : git.Entries(path)) objects.at(entry.stage) = std::move(entry.object);
    return objects;
}

Occasion OccasionOf(const Repository& repository, const Git& git) {
    const Operation operation = OperationIn(repository);
    Occasion occasion{operation.action, "", "", "", git.Commit("HEAD")};
    if (!occasion.head.empty()) occasion.ours = git.NameOfCommit(occasion.head);
    const std::string incoming = operation.incoming.empty() ? "" : git.Commit(operation.incoming);
    if (!incoming.empty()) occasion.theirs = git.NameOfCommit(incoming);
    return occasion;
}

[[noreturn]] void FailWithoutVersions(const Repository& repository, const std::string& path) {
    throw Failure("Nothing is written down of the merge of " + path + ": " +
                  (repository.kind == SystemKind::Mercurial
                       ? "merge it again with ovrin as its tool, \"hg resolve " + path + "\""
                       : "settle it with \"svn resolve " + path + "\", or revert it and merge again"));
}

} // namespace

OpenMerge ReadUnrecordedMerge(const Repository& repository, const std::string& path) {
    if (repository.kind != SystemKind::Git) FailWithoutVersions(repository, path);
    const Git git = Git(repository).WithOwnIndex();
    const auto objects = StagesOf(git, path);
    if (objects[GitEntry::Ours].empty() || objects[GitEntry::Theirs].empty())
        throw Failure(
            std::string(objects[GitEntry::Ours].empty() ? "Ours" : "Theirs") + " has removed " + path +
            ", and the other side has changed it: \"git add\" keeps the file, \"git rm\" removes it");
    OpenMerge merge;
    merge.path = path;
    merge.occasion = OccasionOf(repository, git);
    merge.isBothAdded = objects[GitEntry::Base].empty();
    if (!merge.isBothAdded) merge.texts.base = git.Blob(objects[GitEntry::Base]);
    merge.texts.ours = git.Blob(objects[GitEntry::Ours]);
    merge.texts.theirs = git.Blob(objects[GitEntry::Theirs]);
    return merge;
}

bool IsOfIndex(const Repository& repository, const OpenMerge& merge) {
    if (repository.kind != SystemKind::Git) return true;
    const Git git = Git(repository).WithOwnIndex();
    const auto objects = StagesOf(git, merge.path);
    const auto isText = [&](GitEntry::Stage stage, const std::string& text) {
        return objects.at(stage).empty() || git.Blob(objects.at(stage)) == text;
    };
    return isText(GitEntry::Base, merge.texts.base) && isText(GitEntry::Ours, merge.texts.ours) &&
           isText(GitEntry::Theirs, merge.texts.theirs);
}

} // namespace ovrin
