#include "Systems/GitHistory.h"

#include "ErrorOf.h"
#include "Support/GitFolder.h"
#include "Systems/Git.h"
#include "Words/Failure.h"

#include <algorithm>

namespace {

using namespace ovrin;
using failures::ErrorOf;
using Commits = std::vector<std::string>;

struct GitHistoryTest : GitFolder {
    ovrin::Git Here() const { return ovrin::Git(Found()); }
    Commits Bases(const std::string& ours, const std::string& theirs) const {
        Commits bases = MergeBases(Here(), {"ours", ours}, {"theirs", theirs});
        std::ranges::sort(bases);
        return bases;
    }
    static Commits Sorted(Commits commits) {
        std::ranges::sort(commits);
        return commits;
    }
};

TEST(InstalledGit, TellsItsVersionInTheFormsOfAllMakers) {
    surroundings::FakePrograms programs;
    for (const auto& [told, version] : {std::pair{"git version 2.39.5\n", "2.39"},
                                        {"git version 2.44.0.windows.1\n", "2.44"},
                                        {"git version 10.2 (Maker Git-146)\n", "10.2"}}) {
        programs.Say("git", "version", told);
        EXPECT_EQ(InstalledGit().Text(), version);
    }
    programs.Say("git", "version", "no git\nat all\n");
    EXPECT_EQ(ErrorOf<Failure>([] { InstalledGit(); }), "git doesn't tell its version, but \"no git\"");
    const surroundings::Variable none("PATH", "/nowhere");
    EXPECT_THROW(InstalledGit(), Failure);
}

TEST(InstalledGit, VersionsAreOrderedAsNumbers) {
    const GitVersion versions[] = {{1, 99}, {2, 9}, {2, 38}, {10, 0}};
    for (std::size_t i = 0; i < 4; ++i)
        for (std::size_t j = 0; j < 4; ++j) EXPECT_EQ(versions[i].IsOlderThan(versions[j]), i < j);
}

TEST_F(GitHistoryTest, WithoutACommitThereIsNoneToBeFound) {
    EXPECT_EQ(FindCommit(Here(), "HEAD"), std::nullopt);
    EXPECT_EQ(ErrorOf<Failure>([&] { CheckedOut(Here()); }), "There is no commit here yet on main");
}

TEST_F(GitHistoryTest, RevisionIsACommitOrNothing) {
    const std::string commit = Commit({{"a", "1"}});
    Git({"tag", "-a", "-m", "m", "v1"});
    for (const char* name : {"HEAD", "main", "v1"}) EXPECT_EQ(FindCommit(Here(), name), commit) << name;
    for (const char* name :
         {"", "nothing", "HEAD~1", "HEAD:a", "HEAD^{tree}", "--all", "-q", "a b", "main..main"})
        EXPECT_EQ(FindCommit(Here(), name), std::nullopt) << name;
}

TEST_F(GitHistoryTest, CheckedOutIsTheBranchOrTheCommit) {
    const std::string commit = Commit({{"a", "1"}});
    EXPECT_EQ(CheckedOut(Here()).name, "main");
    EXPECT_EQ(CheckedOut(Here()).id, commit);
    Git({"checkout", "-q", "--detach"});
    EXPECT_EQ(CheckedOut(Here()).name, commit.substr(0, 10));
}

TEST_F(GitHistoryTest, NamesAreThoseOfBranchesAndTags) {
    Commit({});
    Git({"branch", "a/b"});
    Git({"tag", "v1"});
    EXPECT_EQ(RevisionNames(Here()), (Commits{"a/b", "main", "v1"}));
}

TEST_F(GitHistoryTest, BasesOfACrissCrossAreBoth) {
    const std::string root = Commit({{"a", "1"}}), left = CommitOn("left", root, {{"l", "1"}}),
                      right = CommitOn("right", root, {{"r", "1"}});
    EXPECT_EQ(Bases(left, right), Commits{root});
    EXPECT_EQ(Bases(root, right), Commits{root});
    Git({"merge", "-q", "-m", "m", left});
    Git({"checkout", "-q", "left"});
    Git({"merge", "-q", "-m", "m", right});
    EXPECT_EQ(Bases("left", "right"), Sorted({left, right}));
}

TEST_F(GitHistoryTest, StrangersHaveNoBase) {
    const std::string one = Commit({{"a", "1"}});
    Git({"checkout", "-q", "--orphan", "other"});
    EXPECT_EQ(Bases(one, Commit({{"a", "2"}})), Commits{});
}

TEST_F(GitHistoryTest, ShallowCloneIsToldWhereItsEndMayDecide) {
    const std::string root = Commit({{"a", "1"}}), next = Commit({{"a", "2"}});
    CommitOn("old", root, {{"o", "1"}});
    CommitOn("new", next, {{"n", "1"}});
    Git({"checkout", "-q", "main"});
    Commit({{"a", "3"}});
    Git({"clone", "-q", "--no-local", "--no-single-branch", "--depth", "2",
         "file://" + folder.Path().string(), "clone"});
    const surroundings::Here clone("clone");
    const ovrin::Git git(FindRepository().value());
    EXPECT_EQ(MergeBases(git, {"main", "main"}, {"new", "origin/new"}), Commits{next});
    const std::string failure = ErrorOf<Failure>([&] {
        MergeBases(git, {"main", "main"}, {"old", "origin/old"});
    });
    EXPECT_NE(failure.find("main and old parted"), std::string::npos) << failure;
    EXPECT_NE(failure.find("git fetch --unshallow"), std::string::npos) << failure;
}

} // namespace
