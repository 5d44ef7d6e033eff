#include "Systems/WorkingFiles.h"

#include "ErrorOf.h"
#include "Support/GitFolder.h"
#include "Systems/ChangedFile.h"
#include "Systems/LineMerge.h"
#include "Systems/UnmergedFiles.h"
#include "Words/Failure.h"

namespace {

using namespace ovrin;
using Paths = std::vector<std::string>;

const std::string kOdd = "*odd \t\"n\xff\n";

struct WorkingFilesTest : GitFolder {
    std::string Lines(const std::string& base, const std::string& ours, const std::string& theirs) const {
        folder.Write("-base", base);
        folder.Write("ours", ours);
        folder.Write("theirs", theirs);
        const auto merge = MergeLines("-base", "ours", "theirs");
        return std::to_string(merge->conflicts) + " " + merge->text;
    }
};

TEST_F(WorkingFilesTest, TrackedAndChangedFilesOfGitAreToldByTheirBytes) {
    Commit({{kOdd, "1"}, {"b", "1"}, {"sub/c", "1"}, {".gitignore", "ignored\n"}});
    EXPECT_EQ(TrackedFiles(Found()), (Paths{kOdd, ".gitignore", "b", "sub/c"}));
    EXPECT_EQ(DifferingFiles(Found()), Paths{});
    for (const std::string& name : {kOdd, std::string("new"), std::string("ignored")})
        folder.Write(name, "2");
    std::filesystem::remove("b");
    EXPECT_EQ(DifferingFiles(Found()), (Paths{kOdd, "b", "new"}));
}

TEST_F(WorkingFilesTest, AheadOfTheFirstCommitAllThatIsThereHasChanged) {
    folder.Write("added", "1");
    folder.Write("new", "1");
    Git({"add", "added"});
    EXPECT_EQ(DifferingFiles(Found()), (Paths{"added", "new"}));
}

TEST_F(WorkingFilesTest, UnmergedFilesAreSettledByTheirNames) {
    const std::string base = Commit({{kOdd, "1"}, {"also odd", "1"}});
    CommitOn("topic", base, {{kOdd, "2"}, {"also odd", "2"}});
    Git({"checkout", "-q", "main"});
    Commit({{kOdd, "3"}, {"also odd", "3"}});
    EXPECT_EQ(RunProcess({"git", "merge", "topic"}).status, 1);
    const surroundings::Variable another("GIT_INDEX_FILE", "elsewhere"); // as hooks have it
    EXPECT_EQ(UnmergedFiles(Found()), (Paths{kOdd, "also odd"}));
    MarkMerged(Found(), {kOdd});
    EXPECT_EQ(UnmergedFiles(Found()), Paths{"also odd"});
}

TEST_F(WorkingFilesTest, LinesAreMergedAsGitDoesItAndConflictsCounted) {
    EXPECT_EQ(Lines("1\n2\n3\n", "0\n1\n2\n3\n", "1\n2\n3\n4\n"), "0 0\n1\n2\n3\n4\n");
    EXPECT_EQ(Lines("1\n", "2\n", "3\n"), "1 <<<<<<< ours\n2\n=======\n3\n>>>>>>> theirs\n");
    EXPECT_THROW(MergeLines("not there", "ours", "theirs"), Failure);
    const surroundings::Variable none("PATH", "/nowhere");
    EXPECT_EQ(MergeLines("-base", "ours", "theirs"), std::nullopt);
}

TEST_F(WorkingFilesTest, VersionOnDiskIsReadWhenItIsWanted) {
    const FileVersion version = VersionOnDisk("a");
    EXPECT_EQ(failures::ErrorOf<Failure>([&] { version([](std::string_view) { return true; }); }),
              "Cannot read a");
    folder.Write("a", "text");
    EXPECT_EQ(version([](std::string_view text) { return text == "text"; }), "text");
    EXPECT_EQ(version([](std::string_view) { return false; }), std::nullopt);
}

} // namespace
