#include "Systems/GitChanges.h"

#include "ErrorOf.h"
#include "Support/GitFolder.h"
#include "Words/Failure.h"

namespace {

using namespace ovrin;
using failures::ErrorOf;

std::string BytesOf(const FileVersion& version) {
    return version ? version([](std::string_view) { return true; }).value_or("unwanted") : "none";
}

/// "letter path: before -> after" of each file.
std::string Told(const ChangedFiles& changes) {
    std::string told;
    for (const auto& [file, before, after] : changes.files) {
        told += std::string(1, "ARCMPU"[static_cast<std::size_t>(file.status)]) + " " + file.oldPath;
        if (file.newPath != file.oldPath) told += " => " + file.newPath;
        told += ": " + BytesOf(before) + " -> " + BytesOf(after) + "\n";
    }
    return told;
}

struct GitChangesTest : GitFolder {
    GitChangesTest() : first(Commit({{"a", "1"}, {"b", "2"}, {"d/c", "3"}})) {}

    std::string Changes(const ComparisonWish& wish = {}) const { return Told(ListGitChanges(Found(), wish)); }

    const std::string first;
};

TEST_F(GitChangesTest, WorkingTreeIsComparedWithTheIndex) {
    EXPECT_EQ(Changes(), "");
    folder.Write("a", "new");
    std::filesystem::remove("b");
    folder.Write("untracked", "x");
    EXPECT_EQ(Changes(), "C a: 1 -> new\nR b: 2 -> none\n");
    Git({"add", "a"});
    EXPECT_EQ(Changes(), "R b: 2 -> none\n");
    EXPECT_EQ(Changes({.revisions = {}, .paths = {}, .isStaged = true}), "C a: 1 -> new\n");
}

TEST_F(GitChangesTest, OneRevisionIsComparedWithTheWorkingTreeAndTwoWithEachOther) {
    const std::string second = Commit({{"a", "2nd"}, {"new", "n"}});
    folder.Write("a", "3rd");
    EXPECT_EQ(Changes({.revisions = {first}, .paths = {}}), "C a: 1 -> 3rd\nA new: none -> n\n");
    const std::string both = "C a: 1 -> 2nd\nA new: none -> n\n";
    EXPECT_EQ(Changes({.revisions = {first, second}, .paths = {}}), both);
    EXPECT_EQ(Changes({.revisions = {first + ".." + second}, .paths = {}}), both);
    EXPECT_EQ(Changes({.revisions = {first + "..."}, .paths = {}}), both);
    EXPECT_EQ(Changes({.revisions = {second, first}, .paths = {}}), "C a: 2nd -> 1\nR new: n -> none\n");
}

TEST_F(GitChangesTest, RenamesHaveBothPathsAndPathsAreOfAnyBytes) {
    const std::string odd = "odd \t\"\n\xff*";
    std::filesystem::rename("d/c", odd);
    Git({"add", "-A"});
    EXPECT_EQ(Changes({.revisions = {"HEAD"}, .paths = {}}), "M d/c => " + odd + ": 3 -> 3\n");
}

TEST_F(GitChangesTest, WhatIsNoFileHasNoVersion) {
    std::filesystem::remove("a");
    std::filesystem::create_symlink("b", "a");
    Git({"add", "a"});
    EXPECT_EQ(Changes({.revisions = {}, .paths = {}, .isStaged = true}), "C a: 1 -> none\n");
}

TEST_F(GitChangesTest, UserSettingsAndThePresentFolderChangeNothing) {
    folder.Write("a", "new");
    folder.Write("d/c", "new");
    for (const char* setting : {"diff.noprefix", "diff.relative", "diff.mnemonicPrefix"})
        Git({"config", setting, "true"});
    Git({"config", "diff.external", "false"});
    Git({"config", "color.ui", "always"});
    const surroundings::Here below(folder.Path() / "d");
    EXPECT_EQ(Changes(), "C a: 1 -> new\nC d/c: 3 -> new\n");
    EXPECT_EQ(Changes({.revisions = {}, .paths = {"c"}}), "C d/c: 3 -> new\n");
}

TEST_F(GitChangesTest, ConflictIsToldOnce) {
    CommitOn("topic", first, {{"a", "theirs"}});
    Git({"checkout", "-q", "main"});
    Commit({{"a", "ours"}});
    EXPECT_EQ(RunProcess({"git", "merge", "topic"}).status, 1);
    const ChangedFiles changes = ListGitChanges(Found(), {});
    ASSERT_EQ(changes.files.size(), 1u);
    EXPECT_EQ(changes.files[0].file.status, FileStatus::Unmerged);
}

TEST_F(GitChangesTest, PathsThatNameNothingAndWordsThatAreNoRevisionAreTold) {
    EXPECT_EQ(
        ErrorOf<Failure>([&] { Changes({.revisions = {}, .paths = {"nothing"}}); }),
        "\"nothing\" is no revision, and no file that git knows: \"git status\" tells what isn't tracked");
    EXPECT_EQ(Changes({.revisions = {}, .paths = {"b"}}), "");
    EXPECT_THROW(Changes({.revisions = {"nothing"}, .paths = {}}), Failure);
    EXPECT_THROW(Changes({.revisions = {"--output=x"}, .paths = {}}), Failure);
    EXPECT_FALSE(std::filesystem::exists("x"));
    for (const char* word : {"HEAD", "main", "HEAD..main", "main...", "HEAD^{tree}"})
        EXPECT_TRUE(IsGitRevision(word)) << word;
    for (const char* word : {"nothing", "", "a", "--all", "-h"}) EXPECT_FALSE(IsGitRevision(word)) << word;
}

TEST_F(GitChangesTest, RemovedPathOfAnEarlierRevisionNamesSomething) {
    std::filesystem::remove("b");
    const std::string second = Commit({});
    EXPECT_EQ(Changes({.revisions = {first, second}, .paths = {"b"}}), "R b: 2 -> none\n");
}

TEST_F(GitChangesTest, LinesAreThoseOfTheWantedFilesAlone) {
    folder.Write("a", "new");
    folder.Write("b", "new");
    const ChangedFiles changes = ListGitChanges(Found(), {});
    const std::string lines = changes.lines(std::span(&changes.files[1].file, 1));
    EXPECT_TRUE(lines.starts_with("diff --git a/b b/b\n")) << lines;
    EXPECT_EQ(lines.find("a/a"), std::string::npos);
}

TEST_F(GitChangesTest, WhatGitNeverSaidBeforeIsAFailure) {
    surroundings::FakePrograms programs;
    programs.Say("git", "", "");
    for (const std::string& listed : {std::string(":100644 100644 a"), std::string(":1 2 3 4 M"),
                                      std::string("x\0", 2), std::string(":1 2 3 4 R100\0one", 17)}) {
        programs.Say("git", "--raw", listed);
        EXPECT_THROW(Changes({.revisions = {"a", "b"}, .paths = {}}), Failure) << listed;
    }
}

} // namespace
