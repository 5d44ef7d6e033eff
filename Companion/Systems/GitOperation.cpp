#include "Systems/GitOperation.h"

#include "FileUtils.h"
#include "Systems/Repository.h"

namespace ovrin {

namespace {

struct Trace {
    const char* file; ///< in git's folder
    GitOperation operation;
};

} // namespace

GitOperation GitOperationIn(const Repository& repository) {
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
    for (const Trace& trace : traces)
        if (!IsMissing(repository.data + "/" + trace.file)) return trace.operation;
    return {};
}

} // namespace ovrin
