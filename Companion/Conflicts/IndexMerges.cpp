#include "Conflicts/IndexMerges.h"

#include "Names/PrintableText.h"
#include "Scenes/SceneRules.h"
#include "Systems/Git.h"
#include "Systems/Operation.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

namespace ovrin {

namespace {

Occasion OccasionOf(const Repository& repository, const Git& git) {
    const Operation operation = OperationIn(repository);
    Occasion occasion{operation.action, "", "", "", git.Commit("HEAD")};
    if (!occasion.head.empty()) occasion.ours = git.NameOfCommit(occasion.head);
    const std::string incoming = operation.incoming.empty() ? "" : git.Commit(operation.incoming);
    if (!incoming.empty()) occasion.theirs = git.NameOfCommit(incoming);
    return occasion;
}

} // namespace

IndexMerges::IndexMerges(const Repository& repository)
    : m_Repository(repository), m_Blobs(Git(repository).Setting()) {
    if (repository.kind != SystemKind::Git) return;
    for (GitEntry& entry : Git(repository).WithOwnIndex().Unmerged())
        m_Unmerged[entry.path].at(entry.stage) = std::move(entry.object);
}

OpenMerge IndexMerges::Read(const std::string& path) {
    const auto found = m_Unmerged.find(path);
    if (found == m_Unmerged.end())
        throw Failure(
            "nothing is written down of its merge, and " +
            std::string(m_Repository.kind == SystemKind::Mercurial
                            ? "\"hg resolve\" makes it again"
                            : "the versions are no longer known: take the merge back and make it again"));
    const Objects& objects = found->second;
    if (objects[GitEntry::Ours].empty() || objects[GitEntry::Theirs].empty())
        throw Failure(
            std::string(objects[GitEntry::Ours].empty() ? "ours" : "theirs") +
            " has removed it and the other side has not: \"git add\" keeps the file, \"git rm\" removes it");
    const Git git(m_Repository);
    OpenMerge merge;
    merge.path = path;
    merge.occasion = OccasionOf(m_Repository, git);
    merge.isBothAdded = objects[GitEntry::Base].empty();
    const FormatFiles format = FormatFiles::OfEnvironment();
    merge.rules = format.LastingRules();
    merge.typeInfo = format.LastingTypeInfo();
    merge.texts.ours = m_Blobs.Read(objects[GitEntry::Ours]);
    merge.texts.theirs = m_Blobs.Read(objects[GitEntry::Theirs]);
    if (!merge.isBothAdded) merge.texts.base = m_Blobs.Read(objects[GitEntry::Base]);
    return merge;
}

bool IndexMerges::Confirm(const OpenMerge& merge) {
    const auto found = m_Unmerged.find(merge.path);
    if (found == m_Unmerged.end()) return true;
    const auto isText = [&](GitEntry::Stage stage, const std::string& text) {
        const std::string& object = found->second.at(stage);
        return object.empty() || m_Blobs.Read(object) == text;
    };
    return isText(GitEntry::Base, merge.texts.base) && isText(GitEntry::Ours, merge.texts.ours) &&
           isText(GitEntry::Theirs, merge.texts.theirs);
}

} // namespace ovrin
