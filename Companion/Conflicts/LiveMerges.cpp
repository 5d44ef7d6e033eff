#include "Conflicts/LiveMerges.h"

#include "Conflicts/OpenMerges.h"
#include "Scenes/SceneFile.h"
#include "Systems/Git.h"
#include "Systems/GitFiles.h"
#include "Systems/Operation.h"
#include "Systems/Repository.h"
#include "Systems/UnmergedFiles.h"

#include <algorithm>

namespace ovrin {

namespace {

bool Holds(const std::vector<std::string>& sorted, const std::string& path) {
    return std::ranges::binary_search(sorted, path);
}

bool LeavesNoTrace(const Occasion& occasion) {
    return occasion.action.empty() || occasion.action == "stash";
}

std::string FirstWord(const std::string& text) {
    return text.substr(0, text.find(' '));
}

/// Whether a rebase has gone on from the commit that was merged to another one: "git rebase --skip" leaves
/// the head as it was.
bool IsOfAnotherCommit(const Occasion& occasion, const std::string& atHand) {
    if (occasion.action != "rebase" || occasion.theirs.empty() || atHand.empty()) return false;
    const std::string merged = FirstWord(occasion.theirs), now = FirstWord(atHand);
    return !merged.starts_with(now) && !now.starts_with(merged);
}

/// What git knows of merged files.
class GitState {
public:
    GitState(const Repository& repository, const std::vector<OpenMerge>& merges)
        : m_Git(Git(repository).WithOwnIndex()), m_IsUnderWay(!OperationIn(repository).action.empty()),
          m_Head(m_Git.Commit("HEAD")), m_AtHand(CommitAtHand(repository)) {
        std::vector<std::string> paths;
        for (const OpenMerge& merge : merges)
            if (LeavesNoTrace(merge.occasion)) paths.push_back(merge.path);
        if (!paths.empty()) m_Differing = m_Git.DifferingFromHead(paths, false);
        std::ranges::sort(m_Differing);
    }

    bool IsUnderWay(const OpenMerge& merge, bool isUnmerged) const {
        const Occasion& occasion = merge.occasion;
        const bool hasMoved = !occasion.head.empty() && occasion.head != m_Head;
        if (LeavesNoTrace(occasion) &&
            Holds(m_Differing, merge.path)) // other files may be committed meanwhile
            return !hasMoved || m_Git.IsSameIn(occasion.head, m_Head, merge.path);
        if (hasMoved || isUnmerged) return !hasMoved;
        return m_IsUnderWay && occasion.action != "stash" && !IsOfAnotherCommit(occasion, m_AtHand);
    }

private:
    const Git m_Git;
    const bool m_IsUnderWay;
    const std::string m_Head;
    const std::string m_AtHand;           // the commit that a rebase applies
    std::vector<std::string> m_Differing; // of the merges that leave no trace
};

} // namespace

LiveMerges FindLiveMerges(const Repository& repository, const OpenMerges& store) {
    LiveMerges found;
    std::vector<OpenMerge> recorded = store.List();
    const std::vector<std::string> unmerged = UnmergedFiles(repository);
    std::optional<GitState> git;
    if (repository.kind == SystemKind::Git && !recorded.empty()) git.emplace(repository, recorded);
    for (OpenMerge& merge : recorded) {
        const bool isUnmerged = Holds(unmerged, merge.path);
        const bool isLive = git ? git->IsUnderWay(merge, isUnmerged) : isUnmerged;
        (isLive ? found.live : found.stale).push_back(std::move(merge));
    }
    for (const std::string& path : unmerged)
        if (IsSceneName(path) && !std::ranges::binary_search(found.live, path, {}, &OpenMerge::path))
            found.unrecorded.push_back(path);
    return found;
}

} // namespace ovrin
