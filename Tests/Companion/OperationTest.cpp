#include "Systems/Operation.h"

#include "Support/Program.h"
#include "Systems/Repository.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin;

/// The folder of what a system keeps, with files of these names.
struct Traces {
    Traces(SystemKind kind, const std::vector<std::string>& files) : repository{kind, "/", folder.Path()} {
        for (const std::string& file : files) folder.Write(file, "");
    }

    const program::WorkingDirectory folder;
    const Repository repository;
};

Operation FoundIn(SystemKind kind, const std::vector<std::string>& files) {
    return OperationIn(Traces(kind, files).repository);
}

TEST(Operation, OfGitIsToldByItsFiles) {
    const struct {
        std::vector<std::string> files;
        const char *action, *incoming;
    } cases[] = {
        {{}, "", ""},
        {{"HEAD", "index", "ORIG_HEAD"}, "", ""},
        {{"MERGE_HEAD"}, "merge", "MERGE_HEAD"},
        {{"SQUASH_MSG"}, "merge", ""},
        {{"CHERRY_PICK_HEAD"}, "cherry-pick", "CHERRY_PICK_HEAD"},
        {{"REVERT_HEAD"}, "revert", "REVERT_HEAD"},
        {{"rebase-merge/done", "CHERRY_PICK_HEAD"}, "rebase", "REBASE_HEAD"},
        {{"rebase-merge/done", "MERGE_HEAD"}, "rebase", "REBASE_HEAD"},
        {{"rebase-apply/next"}, "rebase", ""},
        {{"rebase-apply/applying"}, "am", ""},
    };
    for (const auto& [files, action, incoming] : cases) {
        const Operation found = FoundIn(SystemKind::Git, files);
        EXPECT_EQ(found.action, action) << testing::PrintToString(files);
        EXPECT_EQ(found.incoming, incoming) << testing::PrintToString(files);
    }
}

TEST(Operation, OfMercurialIsToldByItsFiles) {
    for (const auto& [file, action] : {std::pair{"rebasestate", "rebase"},
                                       {"histedit-state", "histedit"},
                                       {"graftstate", "graft"},
                                       {"shelvedstate", "unshelve"},
                                       {"merge/state2", ""}})
        EXPECT_EQ(FoundIn(SystemKind::Mercurial, {file}).action, action);
}

/// A person who types what is told goes on with that operation and no other.
TEST(Operation, WaysOnAndBackAreOfTheSameCommand) {
    for (const char* file :
         {"rebase-merge", "rebase-apply/applying", "rebase-apply", "CHERRY_PICK_HEAD", "REVERT_HEAD"}) {
        const Operation found = FoundIn(SystemKind::Git, {file});
        EXPECT_EQ(found.proceed, "git " + found.action + " --continue");
        EXPECT_EQ(found.giveUp, "git " + found.action + " --abort");
    }
    EXPECT_EQ(FoundIn(SystemKind::Git, {}).proceed, "");
    EXPECT_EQ(FoundIn(SystemKind::Mercurial, {}).giveUp, "hg merge --abort");
    EXPECT_EQ(FoundIn(SystemKind::Subversion, {"MERGE_HEAD"}).proceed, "svn commit");
}

TEST(Operation, SystemIsAtWorkAsLongAsItsLockIsThere) {
    EXPECT_TRUE(IsAtWork(Traces(SystemKind::Git, {"index.lock"}).repository));
    EXPECT_FALSE(IsAtWork(Traces(SystemKind::Git, {"wlock", "index"}).repository));
    EXPECT_FALSE(IsAtWork({SystemKind::Git, "/", "/nowhere"}));
    const Traces traces(SystemKind::Mercurial, {});
    EXPECT_FALSE(IsAtWork(traces.repository));
    std::filesystem::create_symlink("host:1234", traces.folder.Path() / "wlock"); // leads nowhere
    EXPECT_TRUE(IsAtWork(traces.repository));
}

} // namespace
