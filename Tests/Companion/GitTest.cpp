#include "Systems/Git.h"

#include "ErrorOf.h"
#include "Support/GitFolder.h"
#include "Systems/BlobReader.h"
#include "Systems/Operation.h"
#include "Words/Failure.h"

namespace {

using namespace ovrin;

const std::string kOddName = "*odd \t\"näme\"\n";

/// A repository in which branch "topic" and the present one changed one file, and which is merging them.
struct GitTest : GitFolder {
    GitTest() {
        const std::string base = Commit({{kOddName, "base\n"}});
        CommitOn("topic", base, {{kOddName, "theirs\n"}});
        Git({"checkout", "-q", "main"});
        Commit({{kOddName, "ours\n"}});
        RunProcess({"git", "merge", "topic"});
    }

    ovrin::Git git() const { return ovrin::Git(Found()); }
};

TEST_F(GitTest, ListsTheVersionsOfAnUnmergedPathWithAnyName) {
    const std::vector<GitEntry> entries = git().Unmerged();
    ASSERT_EQ(entries.size(), 3);
    EXPECT_EQ(entries[0].path, kOddName);
    EXPECT_EQ(entries[1].stage, GitEntry::Ours);
    EXPECT_EQ(BlobReader(git().Setting()).Read(entries[2].object), "theirs\n");
}

TEST_F(GitTest, TakesAPathForItself) {
    std::filesystem::copy(kOddName, "an odd file");
    git().Add({kOddName});
    EXPECT_TRUE(git().Unmerged().empty());
    EXPECT_EQ(git().DifferingFromHead({kOddName, "an odd file"}, true), std::vector{kOddName});
    EXPECT_THROW(git().Add({"not there"}), Failure);
}

TEST_F(GitTest, KnowsWhatIsUnderWay) {
    EXPECT_EQ(OperationIn(Found()).action, "merge");
    const std::string incoming = git().Commit(OperationIn(Found()).incoming);
    EXPECT_EQ(git().NameOfCommit(incoming), "topic");
    Git({"merge", "--abort"});
    EXPECT_EQ(OperationIn(Found()).action, "");
    EXPECT_EQ(git().Commit("MERGE_HEAD"), "");
}

TEST_F(GitTest, ComparesFilesAsTheyAreStored) {
    folder.Write(".gitattributes", "* text eol=crlf\n");
    folder.Write(kOddName, "a\r\n");
    EXPECT_TRUE(git().StoresAs(kOddName, "a\n"));
    EXPECT_FALSE(git().StoresAs(kOddName, "b\n"));
}

TEST_F(GitTest, FindsConfigurationOrNothing) {
    Git({"config", "ovrin.take", "theirs"});
    EXPECT_EQ(git().ConfigValue("ovrin.take"), "theirs");
    EXPECT_FALSE(git().ConfigValue("ovrin.none"));
}

TEST_F(GitTest, OwnIndexIsThatOfTheTreeWhateverAHookIsGiven) {
    const surroundings::Variable index("GIT_INDEX_FILE", (folder.Path() / "another").string());
    EXPECT_TRUE(git().Unmerged().empty());
    EXPECT_EQ(git().WithOwnIndex().Unmerged().size(), 3u);
}

TEST_F(GitTest, LaterVariablesTakeThePlaceOfEarlierOnes) {
    const ProcessSetting setting = git().With({{"A", "1"}, {"B", "2"}}).With({{"A", "3"}}).Setting("input");
    EXPECT_EQ(setting.environment,
              (std::vector<std::pair<std::string, std::string>>{{"B", "2"}, {"A", "3"}}));
    EXPECT_EQ(setting.input, "input");
    EXPECT_EQ(setting.folder, folder.Path());
}

TEST_F(GitTest, CommitIsCalledByABranchOrTagOfItsOwn) {
    Git({"merge", "--abort"});
    const std::string first = Git({"rev-parse", "HEAD~1"});
    EXPECT_EQ(git().NameOfCommit(first), Git({"rev-parse", "--short", first}));
    for (const auto& [command, name] : {std::pair<CommandWords, const char*>{
                                            {"update-ref", "refs/remotes/origin/a/b", first}, "origin/a/b"},
                                        {{"tag", "-a", "-m", "words", "v2", first}, "v2"},
                                        {{"branch", "side", first}, "side"}}) {
        Git(command);
        EXPECT_EQ(git().NameOfCommit(first), name);
        Git({"update-ref", "-d", Git({"rev-parse", "--symbolic-full-name", name})});
    }
    EXPECT_TRUE(git().IsSameIn("main", "HEAD", kOddName));
    EXPECT_FALSE(git().IsSameIn("main", "topic", kOddName));
}

TEST_F(GitTest, WhatGitRefusesIsToldInItsWords) {
    const std::string failure = failures::ErrorOf<Failure>([&] { git().Output({"no-such-command"}); });
    EXPECT_TRUE(failure.starts_with("\"git --literal-pathspecs no-such-command\" failed with status 1:\n"))
        << failure;
    surroundings::FakePrograms programs;
    programs.Say("git", "ls-files", std::string("100644 a 0 path\0", 16));
    EXPECT_THROW(git().Entries(), Failure);
}

} // namespace
