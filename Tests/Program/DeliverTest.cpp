#include "Destination.h"

#include "Support/Program.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <sys/stat.h>

namespace {

using namespace program;

/// Whatever becomes of the result later, the destination fares alike.
struct Deliveries : testing::TestWithParam<Durability> {
    int Bring(const std::string& name, const std::string& text, int error = 0) const {
        return Deliver((folder.Path() / name).string(), {text.size(),
                                                         [&](OutputStream& stream) {
                                                             stream.write(text.data(), text.size());
                                                             if (error) stream.Fail(error);
                                                         },
                                                         GetParam()});
    }
    std::size_t CountFiles() const {
        return static_cast<std::size_t>(std::distance(fs::directory_iterator(folder.Path()), {}));
    }
    struct stat Status(const char* name) const {
        struct stat status = {};
        EXPECT_EQ(stat((folder.Path() / name).c_str(), &status), 0);
        return status;
    }

    const WorkingDirectory folder;
};

TEST_P(Deliveries, LeaveTheNewFileAndNothingBesideIt) {
    const std::string large(3'000'000, 'x');
    for (const std::string& text : {std::string("new"), std::string(), large, std::string("\0\n", 2)}) {
        EXPECT_EQ(Bring("file", text), 0);
        EXPECT_TRUE(folder.Read("file") == text);
        EXPECT_EQ(CountFiles(), 1u);
    }
}

TEST_P(Deliveries, ReplaceWhatStandsThereAsAWhole) {
    folder.Write("file", "old");
    fs::permissions(folder.Path() / "file", fs::perms(0751));
    fs::create_symlink("file", folder.Path() / "link");
    const struct stat before = Status("file");
    EXPECT_EQ(Bring("link", "new"), 0);
    EXPECT_EQ(folder.Read("file"), "new");
    EXPECT_TRUE(fs::is_symlink(folder.Path() / "link"));
    EXPECT_EQ(Status("file").st_mode, before.st_mode);
    EXPECT_NE(Status("file").st_ino, before.st_ino) << "who reads the old one goes on with it";
    EXPECT_EQ(CountFiles(), 2u);
}

TEST_P(Deliveries, KeepTheOldFileAfterAFailure) {
    folder.Write("file", "old");
    folder.Write("twice", "old");
    fs::create_hard_link(folder.Path() / "twice", folder.Path() / "name");
    for (const char* name : {"file", "twice", "name", "none"})
        EXPECT_EQ(Bring(name, std::string(200'000, 'x'), ENOSPC), ENOSPC) << name;
    for (const char* name : {"file", "twice", "name"}) EXPECT_EQ(folder.Read(name), "old");
    EXPECT_EQ(CountFiles(), 3u);
}

TEST_P(Deliveries, KeepAllNamesOfAFileOne) {
    folder.Write("one", "old and long");
    fs::create_hard_link(folder.Path() / "one", folder.Path() / "two");
    EXPECT_EQ(Bring("two", "new"), 0);
    EXPECT_EQ(folder.Read("one"), "new");
    EXPECT_EQ(Status("one").st_ino, Status("two").st_ino);
}

TEST_P(Deliveries, TellWhatIsNoPlaceForAFile) {
    folder.Write("file", "old");
    fs::create_directory(folder.Path() / "folder");
    fs::create_symlink("away/file", folder.Path() / "link");
    const std::pair<const char*, int> places[] = {
        {"folder", EISDIR}, {"file/below", ENOTDIR}, {"away/file", ENOENT}, {"link", ENOENT}};
    for (const auto& [name, error] : places) EXPECT_EQ(Bring(name, "new"), error) << name;
    EXPECT_EQ(CountFiles(), 3u);
}

/// Hidden names that a process of the past left behind are in nobody's way.
TEST_P(Deliveries, TouchNoHiddenFileOfAnotherProcess) {
    const std::string hidden = ".ovrinmerge-" + std::to_string(getpid()) + "-";
    for (int i = 0; i < 3; ++i) folder.Write(hidden + std::to_string(i), "theirs");
    EXPECT_EQ(Bring("file", "new"), 0);
    EXPECT_EQ(Bring("file", "newer"), 0);
    EXPECT_EQ(CountFiles(), 4u);
    for (int i = 0; i < 3; ++i) EXPECT_EQ(folder.Read(hidden + std::to_string(i)), "theirs");
}

INSTANTIATE_TEST_SUITE_P(Files, Deliveries,
                         testing::Values(Durability::Synced, Durability::Unsynced, Durability::Passing));

} // namespace
