// Where the program writes: what becomes of the destination, and what is told of it.

#include "Support/Program.h"

#include <gtest/gtest.h>

#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

namespace {

using namespace program;

/// A merge with an open conflict, and its result under the name "expected".
class Writes : public testing::Test {
protected:
    Writes() {
        for (const char* side : {"base.ovrin", "left.ovrin", "right.ovrin"})
            fs::copy(fs::path(OVRIN_SOURCE_DIR) / "Examples" / side, directory.Path());
        EXPECT_EQ(Merge("expected"), 2);
        directory.Write("old", "old\n");
    }

    int Merge(const std::string& dest, const std::string& options = "--fallback none -o report") const {
        return directory.Run("\"$OVRIN\" merge " + options + " base.ovrin left.ovrin right.ovrin " + dest);
    }

    std::string Expected() const { return directory.Read("expected"); }

    void ExpectMerged(const std::string& name) const {
        EXPECT_EQ(directory.Read("stderr"), "");
        EXPECT_EQ(directory.Read(name), Expected());
    }

    void ExpectMessage(const std::string& path, const std::string& reason) const {
        EXPECT_EQ(directory.Read("stderr"), "Cannot write '" + path + "': " + reason + "\n");
    }

    struct stat Status(const char* name) const {
        struct stat status = {};
        EXPECT_EQ(lstat((directory.Path() / name).c_str(), &status), 0);
        return status;
    }

    const WorkingDirectory directory;
};

TEST_F(Writes, WhatCannotBeWrittenIsAFailure) {
    const std::string commands[] = {"merge --fallback none -o report base.ovrin left.ovrin right.ovrin",
                                    "diff base.ovrin left.ovrin", "strip base.ovrin left.ovrin"};
    for (const std::string& command : commands) {
        EXPECT_EQ(directory.Run("\"$OVRIN\" " + command + " >/dev/full"), 1);
        ExpectMessage("-", "No space left on device");
        EXPECT_EQ(directory.Run("\"$OVRIN\" " + command + " /dev/full"), 1);
        ExpectMessage("/dev/full", "No space left on device");
        EXPECT_EQ(directory.Run("\"$OVRIN\" " + command + " nowhere/dest"), 1);
        ExpectMessage("nowhere/dest", "No such file or directory");
        EXPECT_EQ(directory.Run("\"$OVRIN\" " + command + " ."), 1);
        ExpectMessage(".", "Is a directory");
        EXPECT_EQ(directory.Run("\"$OVRIN\" " + command + " >&-"), 1);
        ExpectMessage("-", "Bad file descriptor");
    }
}

TEST_F(Writes, AReportIsLostInSilenceUnlessItSharesStandardOutputWithTheResult) {
    EXPECT_EQ(Merge("dest", "--fallback none -o /dev/full"), 2);
    ExpectMerged("dest");
    EXPECT_EQ(Merge("dest >/dev/full", "--fallback none"), 2);
    ExpectMerged("dest");
    EXPECT_EQ(Merge(">/dev/full", "--fallback none"), 1);
    ExpectMessage("-", "No space left on device");
}

TEST_F(Writes, APipeThatNobodyReadsEndsNothing) {
    const std::string merge = "mkfifo pipe; exec 3<>pipe 4>pipe 3<&-; rm pipe; "
                              "\"$OVRIN\" merge --fallback none base.ovrin left.ovrin right.ovrin";
    EXPECT_EQ(directory.Run(merge + " dest >&4"), 2) << "its report is lost in silence";
    ExpectMerged("dest");
    EXPECT_EQ(directory.Run(merge + " >&4"), 1);
    ExpectMessage("-", "Broken pipe");
}

TEST_F(Writes, NoToolWorksOnPremergedFilesThatAreNotWhole) {
    directory.Write(
        "tools", "ovrin use \"/bin/cp\" %l %d && touch started\n* use \"/bin/cp\" %l %d && touch started\n");
    for (const std::string& places : {std::string("/dev/full right"), std::string("base /dev/full")}) {
        EXPECT_EQ(Merge("old " + places, "-p --fallback tools -o report"), 1);
        ExpectMessage("/dev/full", "No space left on device");
        EXPECT_EQ(directory.Read("started"), "<missing>");
        EXPECT_EQ(directory.Read("old"), "old\n");
        EXPECT_EQ(Merge("dest " + places, "-p --fallback none -o report"), 2) << "nobody works on them";
    }
    EXPECT_EQ(Merge("old base right", "-p --fallback tools -o report"), 0);
    EXPECT_EQ(directory.Read("started"), "");
}

TEST_F(Writes, AToolThatLeavesNoFileLeavesTheDestination) {
    directory.Write("tools", "* use \"/bin/rm\" %d\n");
    EXPECT_EQ(Merge("old", "--fallback tools -o report"), 0);
    EXPECT_EQ(directory.Read("stderr"), "");
    EXPECT_EQ(directory.Read("old"), "old\n");
}

TEST_F(Writes, TheDestinationIsReplacedAndKeepsModeAndOwner) {
    const struct stat before = Status("old");
    directory.Run("chmod 640 old; chown 4242:4243 old; ln -s old link");
    const struct stat owned = Status("old");
    EXPECT_EQ(Merge("link"), 2);
    ExpectMerged("old");
    const struct stat after = Status("old");
    EXPECT_NE(after.st_ino, before.st_ino);
    EXPECT_EQ(after.st_mode, S_IFREG | 0640u);
    EXPECT_EQ(after.st_uid, owned.st_uid);
    EXPECT_EQ(after.st_gid, owned.st_gid);
    EXPECT_TRUE(fs::is_symlink(directory.Path() / "link"));
}

TEST_F(Writes, TheDestinationKeepsItsAccessListAndGetsNoOtherFromTheFolder) {
    // Version 2: the user rw, user 4242 r, the group nothing, the mask r, others nothing.
    const std::string list("\2\0\0\0\1\0\6\0\377\377\377\377\2\0\4\0\222\20\0\0"
                           "\4\0\0\0\377\377\377\377\20\0\4\0\377\377\377\377\40\0\0\0\377\377\377\377",
                           44);
    const std::string folder = directory.Path().string();
    if (setxattr(folder.c_str(), "system.posix_acl_default", list.data(), list.size(), 0) != 0)
        GTEST_SKIP() << "no access lists here";
    const std::string file = folder + "/old";
    EXPECT_EQ(Merge("old"), 2);
    EXPECT_EQ(getxattr(file.c_str(), "system.posix_acl_access", nullptr, 0), -1);
    EXPECT_EQ(setxattr(file.c_str(), "system.posix_acl_access", list.data(), list.size(), 0), 0);
    EXPECT_EQ(Merge("old"), 2);
    char kept[44] = {};
    EXPECT_EQ(getxattr(file.c_str(), "system.posix_acl_access", kept, sizeof(kept)), 44);
    EXPECT_EQ(std::string(kept, sizeof(kept)), list);
}

TEST_F(Writes, ANewDestinationGetsTheModeOfTheUserAndStandsWhereLinksEnd) {
    fs::create_directory(directory.Path() / "folder");
    directory.Run("ln -s ../new folder/second; ln -s folder/second first");
    EXPECT_EQ(directory.Run("umask 027; \"$OVRIN\" strip base.ovrin left.ovrin first"), 0);
    EXPECT_EQ(Status("new").st_mode, S_IFREG | 0640u);
    directory.Run("ln -s loop loop");
    EXPECT_EQ(Merge("loop"), 1);
    ExpectMessage("loop", "Too many levels of symbolic links");
}

TEST_F(Writes, WhatMustKeepItsIdentityIsWrittenInPlace) {
    directory.Run("ln old second; seq 1000 >> old");
    EXPECT_EQ(Merge("old"), 2);
    ExpectMerged("second");
    EXPECT_EQ(Merge("/dev/stdout"), 2);
    ExpectMerged("stdout");
    directory.Run(
        "seq 9 >open; exec 3<open; \"$OVRIN\" merge --fallback none -o report base.ovrin left.ovrin "
        "right.ovrin /dev/fd/3; cat <&3 >seen");
    ExpectMerged("seen");
    EXPECT_EQ(
        directory.Run("mkfifo pipe; cat pipe >piped & \"$OVRIN\" merge --fallback none -o report base.ovrin "
                      "left.ovrin right.ovrin pipe; status=$?; wait; exit $status"),
        2);
    ExpectMerged("piped");
}

TEST_F(Writes, ThePathOfADestinationMayBeAsLongAsTheSystemHasIt) {
    const std::string folder = "$(yes ./ | head -n 2046 | tr -d '\\n')"; // PATH_MAX, 4096, is 4 more
    EXPECT_EQ(Merge(folder + "old"), 2);
    ExpectMerged("old");
}

TEST_F(Writes, AFileWrittenInPlaceGetsItsOldBytesBack) {
    directory.Run("ln old second");
    EXPECT_EQ(directory.Run("prlimit --fsize=100 \"$OVRIN\" strip base.ovrin left.ovrin old"), 1);
    ExpectMessage("old", "File too large");
    EXPECT_EQ(directory.Read("second"), "old\n");
}

/// Permissions don't bind root.
class WritesOfAUser : public Writes {
protected:
    void SetUp() override {
        if (geteuid() == 0 && directory.Run("chown -R 4242 . && " + user + "true") != 0)
            GTEST_SKIP() << "no other user to be";
    }

    int MergeAsUser(const std::string& dest) const {
        // The factory rules may stand where this user can't look.
        directory.Write("rules", "");
        return directory.Run(
            user + "\"$OVRIN\" merge --rules rules --fallback none base.ovrin left.ovrin right.ovrin " +
            dest + " >/dev/null");
    }

    const std::string user = geteuid() == 0 ? "setpriv --reuid 4242 --regid 4242 --clear-groups " : "";
};

TEST_F(WritesOfAUser, AReadOnlyFileIsRefused) {
    directory.Run("chmod 444 old");
    EXPECT_EQ(MergeAsUser("old"), 1);
    ExpectMessage("old", "Permission denied");
    EXPECT_EQ(directory.Read("old"), "old\n");
}

TEST_F(WritesOfAUser, AFileInAReadOnlyFolderIsWrittenInPlace) {
    directory.Run("mkdir folder; cp -p old folder; chmod 555 folder");
    EXPECT_EQ(MergeAsUser("folder/old"), 2) << directory.Read("stderr");
    ExpectMerged("folder/old");
    EXPECT_EQ(MergeAsUser("folder/new"), 1);
    ExpectMessage("folder/new", "Permission denied");
}

} // namespace
