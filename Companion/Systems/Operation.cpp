#include "Systems/Operation.h"

#include "FileUtils.h"
#include "Systems/Repository.h"

#include <filesystem>
#include <span>
#include <system_error>

namespace ovrin {

namespace {

struct Trace {
    const char* file; ///< in the system's folder
    Operation operation;
};

Operation FirstOf(const std::string& folder, std::span<const Trace> traces, Operation otherwise) {
    for (const Trace& trace : traces)
        if (!IsMissing(folder + "/" + trace.file)) return trace.operation;
    return otherwise;
}

Operation OfGit(const std::string& folder) {
    // A rebase picks commits, and may merge some: its own traces come first.
    const Trace traces[] = {
        {"rebase-merge", {"rebase", "git rebase --continue", "git rebase --abort", "REBASE_HEAD"}},
        {"rebase-apply/applying", {"am", "git am --continue", "git am --abort", ""}},
        {"rebase-apply", {"rebase", "git rebase --continue", "git rebase --abort", ""}},
        {"CHERRY_PICK_HEAD",
         {"cherry-pick", "git cherry-pick --continue", "git cherry-pick --abort", "CHERRY_PICK_HEAD"}},
        {"REVERT_HEAD", {"revert", "git revert --continue", "git revert --abort", "REVERT_HEAD"}},
        {"MERGE_HEAD", {"merge", "git commit", "git merge --abort", "MERGE_HEAD"}},
        {"SQUASH_MSG", {"merge", "git commit", "git reset --merge", ""}},
    };
    return FirstOf(folder, traces, {});
}

Operation OfMercurial(const std::string& folder) {
    const Trace traces[] = {
        {"rebasestate", {"rebase", "hg rebase --continue", "hg rebase --abort", ""}},
        {"histedit-state", {"histedit", "hg histedit --continue", "hg histedit --abort", ""}},
        {"graftstate", {"graft", "hg graft --continue", "hg graft --abort", ""}},
        {"shelvedstate", {"unshelve", "hg unshelve --continue", "hg unshelve --abort", ""}},
    };
    return FirstOf(folder, traces, {"", "hg commit", "hg merge --abort", ""});
}

} // namespace

Operation OperationIn(const Repository& repository) {
    switch (repository.kind) {
    case SystemKind::Git:
        return OfGit(repository.data);
    case SystemKind::Mercurial:
        return OfMercurial(repository.data);
    case SystemKind::Subversion:
        break;
    }
    return {"", "svn commit", "svn revert", ""};
}

std::string LockOf(const Repository& repository) {
    return repository.data + (repository.kind == SystemKind::Git ? "/index.lock" : "/wlock");
}

bool IsAtWork(const Repository& repository) {
    std::error_code error;
    // Mercurial's is a link to nothing.
    return std::filesystem::exists(std::filesystem::symlink_status(LockOf(repository), error));
}

} // namespace ovrin
