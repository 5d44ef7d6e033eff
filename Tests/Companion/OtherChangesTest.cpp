#include "Systems/OtherChanges.h"

#include "ErrorOf.h"
#include "Support/Surroundings.h"
#include "Systems/Repository.h"
#include "Systems/UnmergedFiles.h"
#include "Systems/WorkingFiles.h"
#include "Words/Failure.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin;
using failures::ErrorOf;
using Paths = std::vector<std::string>;

/// A working copy of a system that says what it is told to.
struct OtherSystemTest : testing::Test {
    std::string Changes(SystemKind kind, const ComparisonWish& wish = {}) const {
        const auto changes = ListOtherChanges(Copy(kind), wish);
        std::string told;
        for (const auto& [file, before, after] : changes.files)
            told += std::string(before ? "b" : "-") + (after ? "a " : "- ") + file.newPath + "\n";
        return told;
    }
    Repository Copy(SystemKind kind) const { return {kind, programs.Folder(), programs.Folder()}; }
    bool WasCalled(const std::string& call) const {
        return ("\n" + programs.Calls()).find("\n" + call + "\n") != std::string::npos;
    }

    const surroundings::EmptyHome home;
    surroundings::FakePrograms programs;
};

std::string ZeroEnded(std::initializer_list<const char*> entries) {
    std::string listed;
    for (const char* entry : entries) listed += std::string(entry) + '\0';
    return listed;
}

TEST_F(OtherSystemTest, MercurialListsWhatHappenedToPathsOfAnyBytes) {
    programs.Say("hg", "status", ZeroEnded({"Ma b", "Ax\ny", "Rr", "!gone"}));
    EXPECT_EQ(Changes(SystemKind::Mercurial), "ba a b\n-a x\ny\nb- r\nb- gone\n");
    EXPECT_TRUE(WasCalled("hg status -mard -T {status}{path}\\0 --")) << programs.Calls();
    Changes(SystemKind::Mercurial, {.revisions = {"1", "2"}, .paths = {"d"}});
    EXPECT_TRUE(WasCalled("hg status -mard -T {status}{path}\\0 --rev 1 --rev 2 -- d")) << programs.Calls();
}

TEST_F(OtherSystemTest, SubversionListsLinesOfEightColumns) {
    programs.Say("svn", "diff", "M       a b\nA       sub/c\nD       old\n M      property\nM\n");
    EXPECT_EQ(Changes(SystemKind::Subversion), "ba a b\n-a sub/c\nb- old\n");
    EXPECT_TRUE(WasCalled("svn diff --summarize --")) << programs.Calls();
    Changes(SystemKind::Subversion, {.revisions = {"3", "4"}, .paths = {"x@2"}});
    EXPECT_TRUE(WasCalled("svn diff -r 3:4 --summarize -- x@2@")) << programs.Calls();
}

TEST_F(OtherSystemTest, VersionsAreAskedForByNamesThatAreNoPatterns) {
    programs.Say("hg", "status", ZeroEnded({"Mre:x"}));
    programs.Say("hg", "cat", "bytes");
    const auto changes =
        ListOtherChanges(Copy(SystemKind::Mercurial), {.revisions = {"5", "6"}, .paths = {}});
    EXPECT_EQ(changes.files[0].before([](std::string_view) { return true; }), "bytes");
    EXPECT_EQ(changes.files[0].after([](std::string_view) { return false; }), std::nullopt);
    EXPECT_TRUE(WasCalled("hg cat -r 5 -- path:re:x") && WasCalled("hg cat -r 6 -- path:re:x"))
        << programs.Calls();
}

TEST_F(OtherSystemTest, OnlyWhatTheSystemsKnowCanBeWished) {
    EXPECT_THROW(Changes(SystemKind::Mercurial, {.revisions = {}, .paths = {}, .isStaged = true}), Failure);
    EXPECT_THROW(Changes(SystemKind::Subversion, {.revisions = {"1", "2", "3"}, .paths = {}}), Failure);
    programs.Say("hg", "status", "", 255);
    EXPECT_THROW(Changes(SystemKind::Mercurial), Failure);
}

TEST_F(OtherSystemTest, UnmergedFilesAreThoseInConflict) {
    programs.Say("hg", "resolve", ZeroEnded({"Ub", "Rdone", "Ua\nx", "Ub"}));
    EXPECT_EQ(UnmergedFiles(Copy(SystemKind::Mercurial)), (Paths{"a\nx", "b"}));
    programs.Say(
        "svn", "status",
        "C       b c\nM       m\n      C moved\nC\nC       a\nSummary of conflicts:\n  Text conflicts: 2\n");
    EXPECT_EQ(UnmergedFiles(Copy(SystemKind::Subversion)), (Paths{"a", "b c"}));
}

TEST_F(OtherSystemTest, FilesAreMarkedByNamesThatAreNoPatternsAndNoRevisions) {
    programs.Say("hg", "resolve", "");
    programs.Say("svn", "resolve", "");
    MarkMerged(Copy(SystemKind::Mercurial), {"glob:*", "-x"});
    MarkMerged(Copy(SystemKind::Subversion), {"a@b", "-x"});
    EXPECT_EQ(programs.Calls(), "hg resolve --mark --quiet -- path:glob:* path:-x\n"
                                "svn resolve --quiet --accept working -- a@b@ -x@\n");
    programs.Say("hg", "resolve", "", 1);
    EXPECT_THROW(MarkMerged(Copy(SystemKind::Mercurial), {"a"}), Failure);
}

TEST_F(OtherSystemTest, TrackedAndChangedFilesAreInOrderAndOnce) {
    programs.Say("hg", "status", ZeroEnded({"b", "a", "b"}));
    EXPECT_EQ(TrackedFiles(Copy(SystemKind::Mercurial)), (Paths{"a", "b"}));
    programs.Say("svn", "info", "dir        .\nfile       b c\nfile       a\nfile\n");
    EXPECT_EQ(TrackedFiles(Copy(SystemKind::Subversion)), (Paths{"a", "b c"}));
    programs.Say("svn", "status",
                 "M       b\nD       gone\n?       new\n!       lost\nX       external\n C      tree\nA  +   "
                 " copied\n");
    EXPECT_EQ(DifferingFiles(Copy(SystemKind::Subversion)), (Paths{"b", "copied", "new"}));
}

} // namespace
