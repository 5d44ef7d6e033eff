#include "Systems/Repository.h"

#include "ErrorOf.h"
#include "Support/GitFolder.h"
#include "Systems/WorkingPath.h"
#include "Words/Failure.h"

namespace {

using namespace ovrin;
using failures::ErrorOf;
using surroundings::Here;
using surroundings::Variable;

struct RepositoryTest : testing::Test {
    void MakeFolders(std::initializer_list<const char*> paths) const {
        for (const char* path : paths) std::filesystem::create_directories(folder.Path() / path);
    }
    std::optional<Repository> From(const std::string& path) const {
        return FindRepository((folder.Path() / path).string());
    }
    std::string Place(const std::string& path) const { return (folder.Path() / path).string(); }

    const surroundings::EmptyHome home;
    const program::WorkingDirectory folder;
};

TEST_F(RepositoryTest, InnermostOneCountsOfWhateverSystem) {
    MakeFolders({"g/.git", "g/h/.hg", "g/h/s/.svn", "g/h/s/deep/er", "g/plain"});
    EXPECT_EQ(From("g/plain")->kind, SystemKind::Git);
    EXPECT_EQ(From("g/h")->data, Place("g/h/.hg"));
    EXPECT_EQ(From("g/h/s/deep/er")->kind, SystemKind::Subversion);
    EXPECT_EQ(From("g/h/s/deep/er")->top, Place("g/h/s"));
}

TEST_F(RepositoryTest, FileLeadsToTheFolderOfALinkedTree) {
    MakeFolders({"data/tree", "tree/sub"});
    for (const std::string& target : {std::string("../data/tree"), Place("data/tree")})
        for (const char* end : {"", "\n", "\r\n"}) {
            folder.Write("tree/.git", "gitdir: " + target + end);
            EXPECT_EQ(From("tree/sub")->data, Place("data/tree")) << target;
            EXPECT_EQ(From("tree/sub")->top, Place("tree"));
        }
}

TEST_F(RepositoryTest, FileOfAnotherMeaningIsNone) {
    MakeFolders({"outer/.git", "outer/inner"});
    folder.Write("outer/inner/.git", "something else\n");
    EXPECT_EQ(From("outer/inner")->top, Place("outer"));
}

TEST_F(RepositoryTest, BareOneHasNoTop) {
    MakeFolders({"bare/objects", "bare/refs", "half/objects"});
    folder.Write("bare/HEAD", "ref: refs/heads/main\n");
    EXPECT_EQ(From("bare")->top, "");
    EXPECT_EQ(From("bare/refs")->data, Place("bare"));
    EXPECT_FALSE(From("half"));
}

TEST_F(RepositoryTest, LinksOnTheWayAreFollowed) {
    MakeFolders({"real/.git", "real/sub"});
    std::filesystem::create_directory_symlink(folder.Path() / "real/sub", folder.Path() / "link");
    EXPECT_EQ(From("link")->top, Place("real"));
}

TEST_F(RepositoryTest, WhatGitSaysOfItsFoldersWins) {
    MakeFolders({"told", "tree", "here/.git"});
    const Here here(folder.Path() / "here");
    const Variable data("GIT_DIR", "../told");
    EXPECT_EQ(FindRepository()->data, Place("told"));
    EXPECT_EQ(FindRepository()->top, Place("here"));
    folder.Write("told/config", "[core]\n\tbare = true\n");
    EXPECT_EQ(FindRepository()->top, "");
    const Variable tree("GIT_WORK_TREE", Place("tree"));
    EXPECT_EQ(FindRepository()->top, Place("tree"));
    const Variable nowhere("GIT_DIR", "/nowhere");
    EXPECT_EQ(FindRepository()->top, Place("here"));
}

struct WorkingPathTest : RepositoryTest {
    WorkingPathTest() { MakeFolders({"tree/.git", "tree/a/b", "outside"}); }

    std::string PathOf(const std::string& given, const std::string& from = "tree/a") const {
        const Here here(folder.Path() / from);
        return WorkingPath(repository, given);
    }

    const Repository repository{SystemKind::Git, Place("tree"), Place("tree/.git")};
};

TEST_F(WorkingPathTest, IsFromTheTopWhereverOneStands) {
    const std::pair<std::string, const char*> cases[] = {
        {"x.ovrin", "a/x.ovrin"},
        {"./x.ovrin", "a/x.ovrin"},
        {"../x.ovrin", "x.ovrin"},
        {"b/../b/", "a/b"},
        {".", "a"},
        {"..", "."},
        {"../", "."},
        {"b//c/./d", "a/b/c/d"},
        {"odd \n\xff*", "a/odd \n\xff*"},
        {"not/there/x", "a/not/there/x"},
        {Place("tree/q"), "q"},
        {Place("tree"), "."},
    };
    for (const auto& [given, path] : cases) EXPECT_EQ(PathOf(given), path) << given;
}

TEST_F(WorkingPathTest, OutsideIsAFailure) {
    for (const std::string& given : {std::string("../.."), std::string("../../outside/x"), std::string("/"),
                                     Place("tree2/x"), Place("outside")})
        EXPECT_NE(ErrorOf<Failure>([&] { PathOf(given); }).find("outside of the working tree"),
                  std::string::npos)
            << given;
}

TEST_F(WorkingPathTest, LinkIsAFileOfItsOwnAndOneOnTheWayIsFollowed) {
    std::filesystem::create_symlink("../../outside/x", folder.Path() / "tree/a/link");
    std::filesystem::create_directory_symlink("../outside", folder.Path() / "tree/out");
    std::filesystem::create_directory_symlink("a/b", folder.Path() / "tree/in");
    EXPECT_EQ(PathOf("link"), "a/link");
    EXPECT_EQ(PathOf("../in/x"), "a/b/x");
    EXPECT_THROW(PathOf("../out/x"), Failure);
}

TEST_F(WorkingPathTest, ThereIsNoneWithoutAWorkingTree) {
    const Here here(folder.Path());
    EXPECT_THROW(WorkingPath({SystemKind::Git, "", Place("tree/.git")}, "x"), Failure);
}

TEST(IsAtOrBelow, GoesByWholeNames) {
    for (const char* path : {"a", "a/b", "ab", ".x"}) EXPECT_TRUE(IsAtOrBelow(path, ".")) << path;
    for (const char* path : {"a", "a/b", "a/b/c"}) EXPECT_TRUE(IsAtOrBelow(path, "a")) << path;
    for (const char* path : {"ab", "b/a", "", "a.b", "A"}) EXPECT_FALSE(IsAtOrBelow(path, "a")) << path;
}

} // namespace
