#include "Systems/Git.h"

#include "Systems/BlobReader.h"
#include "Systems/Operation.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>

namespace {

using namespace ovrin;

const std::string kOddName = "*odd \t\"näme\"\n";

/// A repository in which branch "topic" and the present one changed one file, and which is merging them.
struct GitTest : testing::Test {
    GitTest() {
        char made[] = "/tmp/ovrin-test-XXXXXX";
        folder = mkdtemp(made);
        RunHere({"git", "init", "-q", "-b", "main"});
        Commit("base\n");
        RunHere({"git", "checkout", "-q", "-b", "topic"});
        Commit("theirs\n");
        RunHere({"git", "checkout", "-q", "main"});
        Commit("ours\n");
        RunProcess(WithUser({"merge", "topic"}), {.folder = folder});
    }
    ~GitTest() override { std::filesystem::remove_all(folder); }

    CommandWords WithUser(CommandWords words) const {
        words.insert(words.begin(), {"git", "-c", "user.name=A", "-c", "user.email=a@example.org"});
        return words;
    }
    void RunHere(const CommandWords& words) const { OutputOf(words, {.folder = folder}); }
    void Write(const std::string& text) const { std::ofstream(folder + "/" + kOddName) << text; }
    void Commit(const std::string& text) const {
        Write(text);
        RunHere({"git", "add", "."});
        RunHere(WithUser({"commit", "-q", "-m", "change"}));
    }
    Repository repository() const { return FindRepository(folder).value(); }
    Git git() const { return Git(repository()); }

    std::string folder;
};

TEST_F(GitTest, ListsTheVersionsOfAnUnmergedPathWithAnyName) {
    const std::vector<GitEntry> entries = git().Unmerged();
    ASSERT_EQ(entries.size(), 3);
    EXPECT_EQ(entries[0].path, kOddName);
    EXPECT_EQ(entries[1].stage, GitEntry::Ours);
    EXPECT_EQ(BlobReader(git().Setting()).Read(entries[2].object), "theirs\n");
}

TEST_F(GitTest, TakesAPathForItself) {
    RunHere({"cp", kOddName, "an odd file"});
    git().Add({kOddName});
    EXPECT_TRUE(git().Unmerged().empty());
    EXPECT_EQ(git().DifferingFromHead({kOddName, "an odd file"}, true), std::vector{kOddName});
    EXPECT_THROW(git().Add({"not there"}), Failure);
}

TEST_F(GitTest, KnowsWhatIsUnderWay) {
    EXPECT_EQ(OperationIn(repository()).action, "merge");
    const std::string incoming = git().Commit(OperationIn(repository()).incoming);
    EXPECT_EQ(git().NameOfCommit(incoming), "topic");
    RunHere({"git", "merge", "--abort"});
    EXPECT_EQ(OperationIn(repository()).action, "");
    EXPECT_EQ(git().Commit("MERGE_HEAD"), "");
}

TEST_F(GitTest, ComparesFilesAsTheyAreStored) {
    std::ofstream(folder + "/.gitattributes") << "* text eol=crlf\n";
    Write("a\r\n");
    EXPECT_TRUE(git().StoresAs(kOddName, "a\n"));
    EXPECT_FALSE(git().StoresAs(kOddName, "b\n"));
}

TEST_F(GitTest, FindsConfigurationOrNothing) {
    RunHere({"git", "config", "ovrin.take", "theirs"});
    EXPECT_EQ(git().ConfigValue("ovrin.take"), "theirs");
    EXPECT_FALSE(git().ConfigValue("ovrin.none"));
}

} // namespace
