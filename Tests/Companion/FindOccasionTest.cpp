#include "Conflicts/FindOccasion.h"

#include "Systems/Caller.h"
#include "Systems/GitFiles.h"
#include "Systems/Repository.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>

namespace {

using namespace ovrin;

const std::string kCommit(40, 'a');

struct FindOccasionTest : testing::Test {
    FindOccasionTest() {
        char folder[] = "/tmp/ovrin-test-XXXXXX";
        data = mkdtemp(folder);
    }
    ~FindOccasionTest() override { std::filesystem::remove_all(data); }

    void Put(const std::string& file, const std::string& text) const {
        const std::filesystem::path path = data + "/" + file;
        std::filesystem::create_directories(path.parent_path());
        std::ofstream(path) << text;
    }
    Repository Git() const { return {SystemKind::Git, "/", data}; }
    Occasion Found(const Caller& caller, const GivenLabels& given = {"%S", "%X", "%Y"}) const {
        return FindOccasion(Git(), caller, given);
    }

    std::string data;
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

} // namespace
