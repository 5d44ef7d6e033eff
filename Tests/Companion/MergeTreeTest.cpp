#include "Systems/MergeTree.h"

#include "ErrorOf.h"
#include "Support/GitFolder.h"
#include "Words/Failure.h"

#include <algorithm>

namespace {

using namespace ovrin;
using failures::ErrorOf;

/// "path [base|ours|theirs] conflicts", with "-" for a side without a file and what stands there else.
std::string Told(const std::vector<UnmergedFile>& files) {
    const auto side = [](const std::optional<TreeEntry>& entry) {
        return entry ? (entry->isFile ? entry->id.substr(0, 3) : "no file") : "-";
    };
    std::string told;
    for (const UnmergedFile& file : files) {
        told += file.path + (file.pathInTheirs.empty() ? "" : " => " + file.pathInTheirs) + " [" +
                side(file.base) + "|" + side(file.ours) + "|" + side(file.theirs) + "]";
        for (const std::string& conflict : file.conflicts) told += " " + conflict;
        told += "\n";
    }
    return told;
}

/// The words of merge-tree: "/" stands for a NUL.
std::string WithZeros(std::string text) {
    std::ranges::replace(text, '/', '\0');
    std::ranges::replace(text, '\\', '/');
    return text;
}

/// A git whose merge-tree says what it is told to; blobs have a size of 7.
struct MergeTreeAnswerTest : testing::Test {
    std::vector<UnmergedFile> List(const std::string& answer, int files, int status = 1) {
        programs.Say("git", "rev-parse", "objects\n");
        programs.Say("git", "merge-tree", WithZeros(answer), status);
        programs.Say("git", "cat-file", sizes);
        std::string attributes;
        for (int i = 0; i < files; ++i)
            attributes += WithZeros(std::string("p/merge/") + (i ? "text/" : "ovrin/"));
        programs.Say("git", "check-attr", attributes);
        return ListUnmerged({SystemKind::Git, programs.Folder(), programs.Folder()}, "oooo", "tttt");
    }

    const surroundings::EmptyHome home;
    surroundings::FakePrograms programs;
    std::string sizes = "7\n7\n7\n7\n7\n7\n7\n7\n7\n";
};

TEST_F(MergeTreeAnswerTest, MergeWithoutMeetingsHasNoFiles) {
    EXPECT_EQ(Told(List("tree/", 0, 0)), "");
    EXPECT_EQ(Told(List("tree//1/a/Auto-merging/words/", 0, 0)), "");
}

TEST_F(MergeTreeAnswerTest, StagesBecomeFilesInTheOrderOfPaths) {
    const auto files = List(
        "tree/100644 aaaa 1\tz/100644 bbbb 2\tz/100755 cccc 3\tz/100644 dddd 1\ta b\n/100644 eeee 3\ta b\n/"
        "/1/z/Auto-merging/w/1/z/CONFLICT (binary)/w/1/a b\n/CONFLICT (modify\\delete)/w/",
        2);
    EXPECT_EQ(Told(files), "a b\n [ddd|-|eee] modify/delete\nz [aaa|bbb|ccc]\n");
    EXPECT_TRUE(files[0].isByObjects);
    EXPECT_FALSE(files[1].isByObjects);
    EXPECT_EQ(files[1].Size(), 21u);
}

TEST_F(MergeTreeAnswerTest, LinksAndSubmodulesAreNoFiles) {
    EXPECT_EQ(Told(List("tree/120000 aaaa 1\ta/160000 bbbb 2\ta/100644 cccc 3\ta//", 1)),
              "a [no file|no file|ccc]\n");
}

TEST_F(MergeTreeAnswerTest, FileInTheWayOfAFolderHasItsOwnNameAgain) {
    EXPECT_EQ(Told(List("tree/100644 aaaa 2\td~oooo//2/d~oooo/d/CONFLICT (file\\directory)/w/", 1)),
              "d [-|aaa|-] file/directory\n");
}

TEST_F(MergeTreeAnswerTest, NameThatEndsLikeThoseOfGitAloneIsChanged) {
    EXPECT_EQ(Told(List("tree/100644 aaaa 2\td~tttt_0/100644 bbbb 2\te~oooox/100644 cccc 2\tf~main//", 3)),
              "d [-|aaa|-]\ne~oooox [-|bbb|-]\nf~main [-|ccc|-]\n");
}

TEST_F(MergeTreeAnswerTest, DifferentRenamesOfOneFileAreOneFile) {
    EXPECT_EQ(
        Told(List(
            "tree/100644 aaaa 1\tb/100644 bbbb 2\to/100644 cccc 3\tt//3/b/o/t/CONFLICT (rename\\rename)/w/",
            1)),
        "o => t [aaa|bbb|ccc] rename/rename\n");
}

TEST_F(MergeTreeAnswerTest, RenamesThatMeetOtherFilesStayApart) {
    EXPECT_EQ(Told(List("tree/100644 aaaa 1\tb/100644 bbbb 2\to/100644 dddd 3\to/100644 cccc 3\tt//"
                        "3/b/o/t/CONFLICT (rename\\rename)/w/",
                        3)),
              "b [aaa|-|-] rename/rename\no [-|bbb|ddd] rename/rename\nt [-|-|ccc] rename/rename\n");
}

TEST_F(MergeTreeAnswerTest, MissingObjectAndARefusalAreFailures) {
    sizes = "aaaa missing\n";
    EXPECT_NE(ErrorOf<Failure>([&] { List("tree/100644 aaaa 1\ta//", 1); }).find("\"aaaa missing\""),
              std::string::npos);
    sizes = "";
    EXPECT_THROW(List("tree/100644 aaaa 1\ta//", 1), Failure);
    EXPECT_THROW(List("", 0, 128), Failure);
}

TEST_F(MergeTreeAnswerTest, NoAnswerEndsTheProgram) {
    const std::string whole = "tree/100644 aaaa 1\tb/100644 bbbb 2\to//3/b/o/t/CONFLICT (rename\\rename)/w/";
    for (std::size_t length = 0; length <= whole.size(); length += 15)
        for (const char* more : {"", "//-1", "\t\t  "}) {
            try {
                List(whole.substr(0, length) + more, 1);
            } catch (const std::exception&) {
                // is as good as an answer
            }
        }
}

/// The same with the git that is there.
struct MergeTreeTest : GitFolder {
    /// A side's files are changed, those of empty texts removed.
    std::string Make(const std::string& branch, const std::string& from,
                     const std::map<std::string, std::string>& files) const {
        Git({"checkout", "-q", "-b", branch, from});
        std::map<std::string, std::string> written;
        for (const auto& [name, text] : files)
            if (text.empty())
                std::filesystem::remove(name);
            else
                written[name] = text;
        return Commit(written);
    }
    std::vector<UnmergedFile> List(const std::map<std::string, std::string>& ours,
                                   const std::map<std::string, std::string>& theirs) const {
        const std::string theirCommit = Make("theirs", base, theirs), ourCommit = Make("ours", base, ours);
        return ListUnmerged(Found(), ourCommit, theirCommit);
    }
    static std::string Names(const std::vector<UnmergedFile>& files) {
        std::string names;
        for (const UnmergedFile& file : files) {
            names += (names.empty() ? "" : ", ") + file.path;
            for (const std::string& conflict : file.conflicts) names += " (" + conflict + ")";
        }
        return names;
    }

    const std::string lines = "1\n2\n3\n4\n5\n6\n7\n8\n";
    const std::string base =
        Commit({{"a", lines}, {"b", lines + "b\n"}, {".gitattributes", "a merge=ovrin\n"}});
};

TEST_F(MergeTreeTest, FileOfBothSidesNeedsMergingEvenWhereLinesDontMeet) {
    const auto files = List({{"a", "0\n" + lines}, {"b", "new\n"}}, {{"a", lines + "9\n"}, {"x", "1\n"}});
    EXPECT_EQ(Names(files), "a");
    EXPECT_TRUE(files[0].isByObjects);
    EXPECT_EQ(files[0].Size(), 3 * lines.size() + 4);
}

TEST_F(MergeTreeTest, RemovalsRenamesAndFoldersAreTold) {
    EXPECT_EQ(Names(List({{"a", ""}, {"b", "ours\n"}, {"odd \t\"\xff", "1\n"}},
                         {{"a", "0\n" + lines}, {"b", "theirs\n"}, {"odd \t\"\xff", "2\n"}})),
              "a (modify/delete), b, odd \t\"\xff");
}

TEST_F(MergeTreeTest, RenamedFileHasTheVersionsOfBothNames) {
    const auto files = List({{"a", ""}, {"moved", lines + "9\n"}}, {{"a", "0\n" + lines}});
    EXPECT_EQ(Names(files), "moved");
    EXPECT_TRUE(files.at(0).base && files.at(0).ours && files.at(0).theirs);
}

TEST_F(MergeTreeTest, RepositoryAndItsSettingsStayAsTheyAre) {
    Git({"config", "merge.ovrin.driver", "touch touched"});
    Git({"config", "merge.default", "ovrin"});
    const std::size_t before = Git({"count-objects"}).size();
    EXPECT_EQ(Names(List({{"b", "ours\n"}}, {{"b", "theirs\n"}})), "b");
    EXPECT_FALSE(std::filesystem::exists("touched"));
    EXPECT_EQ(Git({"status", "--porcelain"}), "");
    EXPECT_EQ(Git({"count-objects"}).size(), before + 1); // two commits make it of two digits
}

/// A clone that has no blobs but those that are checked out.
TEST_F(MergeTreeTest, BlobsThatAPartialCloneLacksAreFetchedAtOnce) {
    for (int i = 0; i < 6; ++i)
        Make("step" + std::to_string(i), i ? "HEAD" : base, {{"s" + std::to_string(i), lines}});
    const std::string start = Git({"rev-parse", "HEAD"});
    std::map<std::string, std::string> ours, theirs;
    for (int i = 0; i < 6; ++i) {
        ours["s" + std::to_string(i)] = lines + "ours " + std::to_string(i) + "\n";
        theirs["s" + std::to_string(i)] = std::to_string(i) + "theirs\n" + lines;
    }
    const std::string theirCommit = Make("theirs", start, theirs), ourCommit = Make("ours", start, ours);
    Git({"config", "uploadpack.allowFilter", "true"});
    Git({"config", "uploadpack.allowAnySHA1InWant", "true"});
    Git({"clone", "-q", "--no-local", "--filter=blob:none", "file://" + folder.Path().string(), "clone"});
    const surroundings::Here clone("clone");
    const auto packs = [] { return OutputOf({"sh", "-c", "ls .git/objects/pack/*.pack | wc -l"}); };
    const int before = std::stoi(packs());
    EXPECT_EQ(ListUnmerged(FindRepository().value(), ourCommit, theirCommit).size(), 6u);
    EXPECT_EQ(std::stoi(packs()), before + 1);
}

} // namespace
