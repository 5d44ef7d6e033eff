#include "Conflicts/IndexMerges.h"

#include "Names/PrintableText.h"
#include "Systems/Git.h"
#include "Systems/Operation.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <vector>

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

IndexMerges::IndexMerges(const Repository& repository) : m_Repository(repository) {
    if (repository.kind != SystemKind::Git) return;
    for (GitEntry& entry : Git(repository).WithOwnIndex().Unmerged())
        m_Unmerged[entry.path].at(entry.stage) = std::move(entry.object);
}

OpenMerge IndexMerges::Read(const std::string& path) const {
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
    const std::vector<std::string> texts =
        git.Blobs({objects[GitEntry::Ours], objects[GitEntry::Theirs],
                   merge.isBothAdded ? objects[GitEntry::Ours] : objects[GitEntry::Base]});
    merge.texts = {merge.isBothAdded ? "" : texts[2], texts[0], texts[1]};
    return merge;
}

bool IndexMerges::Confirm(const OpenMerge& merge) const {
    const auto found = m_Unmerged.find(merge.path);
    if (found == m_Unmerged.end()) return true;
    const ThreeTexts& texts = merge.texts;
    const std::string* const all[] = {nullptr, &texts.base, &texts.ours, &texts.theirs};
    std::vector<std::string> objects;
    std::vector<const std::string*> expected;
    for (const auto stage : {GitEntry::Base, GitEntry::Ours, GitEntry::Theirs}) {
        if (found->second.at(stage).empty()) continue;
        objects.push_back(found->second.at(stage));
        expected.push_back(all[stage]);
    }
    const std::vector<std::string> blobs = Git(m_Repository).Blobs(objects);
    for (std::size_t i = 0; i < blobs.size(); ++i)
        if (blobs[i] != *expected[i]) return false;
    return true;
}

} // namespace ovrin
