#include "Conflicts/FindOccasion.h"

#include "Support/Surroundings.h"
#include "Systems/Caller.h"
#include "Systems/GitFiles.h"
#include "Systems/Repository.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin;

const std::string kCommit(40, 'a');

struct FindOccasionTest : testing::Test {
    void Put(const std::string& file, const std::string& text) const { folder.Write(file, text); }
    Repository Git() const { return {SystemKind::Git, "/", folder.Path()}; }
    Occasion Found(const Caller& caller, const GivenLabels& given = {"%S", "%X", "%Y"}) const {
        return FindOccasion(Git(), caller, given);
    }

    const surroundings::EmptyHome home;
    const program::WorkingDirectory folder;
};

TEST_F(FindOccasionTest, HeadIsFoundLooseAndPackedAndDetached) {
    Put("HEAD", "ref: refs/heads/a/b\n");
    Put("packed-refs", "# pack-refs with: peeled\n" + kCommit + " refs/heads/a/b\n" + std::string(40, 'b') +
                           " refs/heads/b\n");
    EXPECT_EQ(ReadGitHead(Git()).commit, kCommit);
    EXPECT_EQ(ReadGitHead(Git()).branch, "a/b");
    Put("refs/heads/a/b", std::string(40, 'c') + "\n");
    EXPECT_EQ(ReadGitHead(Git()).commit, std::string(40, 'c'));
    Put("HEAD", kCommit + "\n");
    EXPECT_EQ(ReadGitHead(Git()).commit, kCommit);
    EXPECT_EQ(ReadGitHead(Git()).branch, "");
}

TEST_F(FindOccasionTest, LabelsThatSayNothingAreReplaced) {
    Put("HEAD", kCommit + "\n");
    const Occasion occasion = Found({"git", "cherry-pick", {"-x", "topic"}}, {"3f2a1c9", "HEAD", "%Y"});
    EXPECT_EQ(occasion.base, "3f2a1c9");
    EXPECT_EQ(occasion.ours, "aaaaaaa");
    EXPECT_EQ(occasion.theirs, "topic");
    EXPECT_EQ(occasion.head, kCommit);
}

TEST_F(FindOccasionTest, RebaseIsNoticedBehindAnAliasToo) {
    Put("HEAD", kCommit + "\n");
    Put("logs/HEAD", "0 1 T <t> 1 +0000\trebase (start): checkout origin/main\n");
    Put("rebase-merge/done", "pick " + std::string(40, 'd') + " First\npick " + kCommit + " Dim the light\n");
    const Occasion occasion = Found({"git", "an-alias", {}});
    EXPECT_EQ(occasion.action, "rebase");
    EXPECT_EQ(occasion.ours, "origin/main");
    EXPECT_EQ(occasion.theirs, "aaaaaaa (Dim the light)");
}

TEST_F(FindOccasionTest, NothingIsRequired) {
    const Occasion occasion = FindOccasion(std::nullopt, std::nullopt, {});
    EXPECT_EQ(occasion.action + occasion.base + occasion.ours + occasion.theirs + occasion.head, "");
    EXPECT_EQ(Found({}).action, "");
}

TEST_F(FindOccasionTest, SidesOfEveryCommandAreToldAsItsUserSeesThem) {
    Put("HEAD", "ref: refs/heads/main\n");
    Put("refs/heads/main", kCommit + "\n");
    const struct {
        Caller caller;
        const char *action, *base, *ours, *theirs;
    } cases[] = {
        {{"git", "merge", {"topic"}}, "merge", "", "main", ""},
        {{"git", "stash", {"pop"}}, "stash", "", "main", "the stash"},
        {{"git", "am", {"x.patch"}}, "am", "", "main", "the patch"},
        {{"git", "am", {"--rebasing"}}, "rebase", "", "main", ""},
        {{"git", "cherry-pick", {kCommit}}, "cherry-pick", "", "main", "aaaaaaa"},
        {{"git", "cherry-pick", {"a", "b"}}, "cherry-pick", "", "main", ""},
        {{"git", "cherry-pick", {"-n", "topic"}}, "", "", "main", "topic"},
        {{"git", "revert", {"topic"}}, "revert", "topic", "main", "parent of topic"},
        {{"git", "revert", {"--no-commit", "topic"}}, "", "topic", "main", "parent of topic"},
        {{"git", "checkout", {"-m", "topic"}}, "", "", "topic", "your changes"},
        {{"git", "switch", {"-m", "topic"}}, "", "", "topic", "your changes"},
        {{"git", "merge-tree", {"--write-tree", "a", kCommit}}, "", "", "a", "aaaaaaa"},
        {{"git", "merge-tree", {"a"}}, "", "", "", ""},
    };
    for (const auto& [caller, action, base, ours, theirs] : cases) {
        const Occasion found = Found(caller);
        EXPECT_EQ(found.action + "," + found.base + "," + found.ours + "," + found.theirs,
                  std::string(action) + "," + base + "," + ours + "," + theirs)
            << caller.command << testing::PrintToString(caller.words);
    }
}

TEST_F(FindOccasionTest, MergeNamesWhatItWasGivenEvenBehindAnAlias) {
    Put("HEAD", kCommit + "\n");
    const surroundings::Variable name(("GITHEAD_" + kCommit).c_str(), "origin/topic");
    EXPECT_EQ(Found({"git", "merge", {}}).theirs, "origin/topic");
    EXPECT_EQ(Found({"git", "an-alias", {}}).action, "merge");
}

TEST_F(FindOccasionTest, FileThatIsMergedAgainBelongsToWhatIsUnderWay) {
    Put("HEAD", kCommit + "\n");
    Put("CHERRY_PICK_HEAD", kCommit + "\n");
    EXPECT_EQ(Found({"git", "checkout", {"--merge", "a.ovrin"}}).action, "cherry-pick");
    EXPECT_EQ(Found({"git", "restore", {"--merge", "--", "a.ovrin"}}).action, "cherry-pick");
}

TEST_F(FindOccasionTest, OtherSystemsHaveTheirOwnWords) {
    const surroundings::Variable base("HG_BASE_NODE", std::string(40, 'b')),
        mine("HG_MY_NODE", std::string(40, 'c'));
    const Occasion graft =
        FindOccasion(Repository{SystemKind::Mercurial, "/", "/"}, Caller{"hg", "graft", {}}, {});
    EXPECT_EQ(graft.action + " " + graft.base + " " + graft.ours, "graft bbbbbbbbbbbb cccccccccccc");
    EXPECT_EQ(
        FindOccasion(Repository{SystemKind::Mercurial, "/", "/"}, Caller{"hg", "resolve", {}}, {}).action,
        "");
    const Occasion update = FindOccasion(Repository{SystemKind::Subversion, "/", "/"},
                                         Caller{"svn", "update", {}}, {"", "trunk", "base"});
    EXPECT_EQ(update.action + ", " + update.ours + ", " + update.theirs, "update, trunk, the repository");
}

TEST(IsWithoutTree, IsSoOfWhatMergesBesideIt) {
    for (const char* command : {"merge-tree", "replay"})
        EXPECT_TRUE(IsWithoutTree(Caller{"git", command, {}}));
    EXPECT_FALSE(IsWithoutTree(Caller{"git", "merge", {}}));
    EXPECT_FALSE(IsWithoutTree(Caller{"hg", "replay", {}}));
    EXPECT_FALSE(IsWithoutTree(std::nullopt));
}

} // namespace
