#include "FileUtils.h"

#include "ErrorOf.h"
#include "InputFiles.h"
#include "Session/MergeSession.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sys/stat.h>
#include <thread>

namespace {

using failures::ErrorOf;

/// A file of that content, removed at the end of the test.
class TempFile {
public:
    explicit TempFile(const std::string& content = "") : path(CreateTempFile()) { Write(content); }
    ~TempFile() { std::filesystem::remove(path); }
    void Write(const std::string& content) const { std::ofstream(path, std::ios::binary) << content; }
    const std::string path;
};

std::string ReadError(const std::string& path) {
    return ErrorOf([&] { ovrin_yaml::MergeSession().Read({FileInput(path), FileInput(path)}); });
}

TEST(FileUtils, TheExtensionStandsBehindTheLastDotOfThePath) {
    const std::pair<const char*, const char*> cases[] = {{"a.ovrin", "ovrin"},
                                                         {".ovrin", "ovrin"},
                                                         {"a.ovrin.orig", "orig"},
                                                         {"name", ""},
                                                         {"name.", ""},
                                                         {"", ""},
                                                         {"dir.d/name", "d/name"}};
    for (const auto& [path, extension] : cases) EXPECT_EQ(GetFileExtension(path), extension) << path;
}

TEST(FileUtils, TemporaryFilesAreNewEmptyAndWithoutExtension) {
    const TempFile first, second;
    EXPECT_NE(first.path, second.path);
    EXPECT_TRUE(first.path.starts_with("/tmp/MERGE"));
    EXPECT_EQ(GetFileExtension(first.path), "");
    EXPECT_TRUE(FileExists(first.path.c_str()));
    EXPECT_TRUE(IsFileEmpty(first.path));
}

TEST(FileUtils, AMissingFileIsNotEmpty) {
    EXPECT_FALSE(IsFileEmpty("/nonexistent"));
    EXPECT_FALSE(FileExists("/nonexistent"));
    EXPECT_FALSE(IsFileEmpty(TempFile("x").path));
}

TEST(FileUtils, WithoutHomeTheHomeDirectoryIsATilde) {
    const std::string before = GetUserHomeDir();
    setenv("HOME", "/home/somebody", 1);
    EXPECT_EQ(GetUserHomeDir(), "/home/somebody");
    unsetenv("HOME");
    EXPECT_EQ(GetUserHomeDir(), "~");
    setenv("HOME", before.c_str(), 1);
}

TEST(FileUtils, DataFilesStandBesideTheExecutable) {
    const auto executable = std::filesystem::read_symlink("/proc/self/exe");
    EXPECT_EQ(GetDataFilesDir(), executable.parent_path().string() + "/");
}

TEST(FileUtils, AFileIsReadToItsEnd) {
    for (const std::size_t size : {0u, 1u, 4096u, 1000000u}) {
        const std::string content(size, '\0');
        std::string bytes = "old";
        EXPECT_EQ(ReadWholeFile(TempFile(content).path, bytes), ReadResult::Complete);
        EXPECT_EQ(bytes, content);
    }
}

TEST(FileUtils, APipeIsReadToItsEnd) {
    const TempFile pipe;
    std::filesystem::remove(pipe.path);
    ASSERT_EQ(mkfifo(pipe.path.c_str(), 0600), 0);
    const std::string content(300000, 'x');
    std::string bytes;
    {
        const std::jthread writer([&] { pipe.Write(content); });
        EXPECT_EQ(ReadWholeFile(pipe.path, bytes), ReadResult::Complete);
    }
    EXPECT_EQ(bytes, content);
}

TEST(FileUtils, ADirectoryCanBeOpenedButNotRead) {
    std::string bytes;
    EXPECT_EQ(ReadWholeFile("/nonexistent", bytes), ReadResult::CannotOpen);
    EXPECT_EQ(ReadWholeFile("/tmp", bytes), ReadResult::CannotRead);
}

TEST(InputFiles, FaultsNameTheFile) {
    EXPECT_EQ(ReadError("/nonexistent"), "Error parsing file '/nonexistent': Cannot open file");
    EXPECT_EQ(ReadError("/tmp"), "Error parsing file '/tmp': Cannot read file");
    for (const char* path : {"/nonexistent", "/tmp"})
        EXPECT_EQ(ErrorOf([&] { SetupRules(path); }),
                  std::string("Cannot open rules file for reading:") + path);
}

} // namespace
