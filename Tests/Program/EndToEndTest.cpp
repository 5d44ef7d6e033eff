// The built program with real files, exit statuses and standard streams.

#include "Support/Program.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <set>

namespace {

using namespace program;

/// One folder of the test data.
class Case {
public:
    explicit Case(const fs::path& folder) : m_Folder(folder) {}

    std::string Args() const { return OneLine("args"); }
    int Status() const { return std::stoi(OneLine("status")); }

    void CopyInputs(const WorkingDirectory& directory) const {
        for (const auto& entry : fs::directory_iterator(m_Folder))
            if (entry.path().extension() != ".expected") fs::copy(entry.path(), directory.Path());
    }

    /// Names of the files whose content is told, and of those that must not have any.
    std::set<std::string> Outputs() const {
        std::set<std::string> names = {"stdout", "stderr", "dest.ovrin"};
        for (const auto& entry : fs::directory_iterator(m_Folder))
            if (entry.path().extension() == ".expected") names.insert(entry.path().stem().string());
        return names;
    }

    std::string Expected(const std::string& name) const {
        const fs::path path = m_Folder / (name + ".expected");
        return fs::exists(path) ? ReadFile(path) : name == "dest.ovrin" ? "<missing>" : "";
    }

private:
    std::string OneLine(const char* name) const {
        const std::string text = ReadFile(m_Folder / name);
        return text.substr(0, text.find('\n'));
    }

    fs::path m_Folder;
};

void RunCase(const fs::path& folder, const std::string& option) {
    const Case expected(folder);
    const WorkingDirectory directory;
    expected.CopyInputs(directory);
    const std::string args = expected.Args();
    const std::size_t behindCommand = args.find(' ');
    const std::string command =
        "\"$OVRIN\" " + args.substr(0, behindCommand) + option + args.substr(behindCommand);
    EXPECT_EQ(directory.Run(command), expected.Status()) << command << "\n" << directory.Read("stderr");
    for (const std::string& name : expected.Outputs())
        EXPECT_EQ(directory.Read(name), expected.Expected(name)) << name << " of " << command;
}

class EndToEndCase : public testing::TestWithParam<std::string> {};

TEST_P(EndToEndCase, GivesWhatItsFolderTells) {
    RunCase(fs::path(OVRIN_TEST_DATA) / GetParam(), "");
}

TEST_P(EndToEndCase, GivesTheSameWithoutThreads) {
    RunCase(fs::path(OVRIN_TEST_DATA) / GetParam(), " --nothreads");
}

std::set<std::string> CaseNames() {
    std::set<std::string> names;
    for (const auto& entry : fs::directory_iterator(OVRIN_TEST_DATA))
        if (entry.is_directory()) names.insert(entry.path().filename().string());
    return names;
}

INSTANTIATE_TEST_SUITE_P(Folders, EndToEndCase, testing::ValuesIn(CaseNames()), [](const auto& info) {
    std::string name = info.param;
    std::replace(name.begin(), name.end(), '-', '_');
    return name;
});

/// A clean merge whose inputs can be spoilt one by one.
class BadInput : public testing::Test {
protected:
    BadInput() {
        Case(fs::path(OVRIN_TEST_DATA) / "lists-of-one-object").CopyInputs(directory);
        directory.Write("dest.ovrin", "untouched\n");
    }

    int Merge() const {
        return directory.Run("\"$OVRIN\" merge --fallback none base.ovrin left.ovrin right.ovrin dest.ovrin");
    }

    /// The merge fails with this text and leaves the destination as it was.
    void ExpectFailure(const std::string& text) const {
        EXPECT_EQ(Merge(), 1) << text;
        EXPECT_EQ(directory.Read("stderr"), text + "\n");
        EXPECT_EQ(directory.Read("stdout"), "");
        EXPECT_EQ(directory.Read("dest.ovrin"), "untouched\n");
    }

    const WorkingDirectory directory;
    const std::string noSignature =
        "File is not a valid text serialized YAML file. Make sure that Asset Serialization is set to 'Force "
        "text' in Editor Settings.";
};

TEST_F(BadInput, OfAnyFileLeavesTheDestinationUntouched) {
    const std::string header = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";
    const std::pair<std::string, std::string> contents[] = {
        {"", noSignature},
        {std::string("\x7f"
                     "ELF\2\1\1\0\0\0\0",
                     11),
         noSignature},
        {header + "--- !o!1 &1", "Error locating end of document sequence"},
        {header + "--- !o!1 &1\na: 'cut", "found unexpected end of stream"},
        {header + "--- !o!1 &1\na: \xc3", "Incomplete UTF-8 octet sequence"},
        {header + "--- !o!1 &1\n- a\n", "Document root is not a mapping"}};
    for (const char* name : {"base.ovrin", "left.ovrin", "right.ovrin"}) {
        const std::string good = directory.Read(name);
        for (const auto& [content, error] : contents) {
            directory.Write(name, content);
            ExpectFailure(std::string("Error parsing file '") + name + "': " + error);
        }
        directory.Write(name, good);
    }
}

TEST_F(BadInput, AFileThatIsNoFileIsTold) {
    fs::remove(directory.Path() / "left.ovrin");
    ExpectFailure("Error parsing file 'left.ovrin': Cannot open file");
    fs::create_directory(directory.Path() / "left.ovrin");
    ExpectFailure("Error parsing file 'left.ovrin': Cannot read file");
}

TEST_F(BadInput, TwoObjectsOfOneIdAreNoScene) {
    directory.Write("left.ovrin",
                    directory.Read("left.ovrin") + "--- !o!1 &10\nGameObject:\n  m_Name: other\n");
    EXPECT_EQ(Merge(), 1);
    EXPECT_NE(
        directory.Read("stderr").find("Cannot perform this operation on a YAML file with duplicate keys"),
        std::string::npos);
    EXPECT_EQ(directory.Read("dest.ovrin"), "untouched\n");
}

TEST_F(BadInput, OfSeveralFilesTheFirstIsTold) {
    directory.Write("right.ovrin", "x");
    directory.Write("left.ovrin", "x");
    ExpectFailure("Error parsing file 'left.ovrin': " + noSignature);
    directory.Write("base.ovrin", "x");
    ExpectFailure("Error parsing file 'base.ovrin': " + noSignature);
}

TEST_F(BadInput, AFileCutAnywhereIsMergedOrRefused) {
    const std::string whole = directory.Read("left.ovrin");
    for (std::size_t length = 0; length < whole.size(); length += 7) {
        directory.Write("left.ovrin", whole.substr(0, length));
        directory.Write("dest.ovrin", "untouched\n");
        const int status = Merge();
        EXPECT_LE(status, 2) << length;
        EXPECT_EQ(directory.Read("dest.ovrin") == "untouched\n", status == 1) << length;
    }
}

/// One program fills all three, in any order, and waits for each to be read.
TEST_F(BadInput, PipesAreNone) {
    ASSERT_EQ(Merge(), 0);
    const std::string merged = directory.Read("dest.ovrin");
    for (const char* order : {"base left right", "right left base", "left right base"}) {
        for (const char* option : {"", "--nothreads "}) {
            const std::string command =
                "mkfifo base left right; (for f in " + std::string(order) +
                "; do cat $f.ovrin > $f; done) & \"$OVRIN\" merge " + option +
                "--force --fallback none base left right dest.ovrin; s=$?; wait; rm base left right; exit $s";
            EXPECT_EQ(directory.Run("timeout 20 sh -c '" + command + "'"), 0) << order << option;
            EXPECT_EQ(directory.Read("dest.ovrin"), merged) << order << option;
        }
    }
}

TEST_F(BadInput, MoreThanTheMemoryIsTold) {
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
    GTEST_SKIP() << "sanitizers need more memory than the test leaves";
#endif
    directory.Run("truncate -s 300M base.ovrin");
    for (const char* command : {"merge --fallback none base.ovrin left.ovrin right.ovrin dest.ovrin",
                                "diff base.ovrin left.ovrin dest.ovrin"}) {
        EXPECT_EQ(directory.Run(std::string("ulimit -v 200000; \"$OVRIN\" ") + command), 1) << command;
        EXPECT_EQ(directory.Read("stderr"), "Out of memory\n") << command;
        EXPECT_EQ(directory.Read("dest.ovrin"), "untouched\n");
    }
}

TEST_F(BadInput, LittleMemoryCutsNothingOff) {
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
    GTEST_SKIP() << "sanitizers need more memory than the test leaves";
#endif
    for (const std::string name : {"base", "left"}) {
        std::string text = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";
        for (int id = 1; id < 3000; ++id)
            text += "--- !o!1 &" + std::to_string(id) + "\nA: " + name + std::string(3000, 'x') + "\n";
        directory.Write(name + ".ovrin", text);
    }
    for (const std::string command : {"strip", "diff"}) {
        EXPECT_EQ(directory.Run("\"$OVRIN\" " + command + " base.ovrin left.ovrin whole"), 0);
        for (int kilobytes = 30000; kilobytes < 110000; kilobytes += 4000) {
            directory.Write("dest.ovrin", "untouched\n");
            const int status = directory.Run("ulimit -v " + std::to_string(kilobytes) + "; \"$OVRIN\" " +
                                             command + " --nothreads base.ovrin left.ovrin dest.ovrin");
            EXPECT_TRUE(directory.Read("dest.ovrin") == (status ? "untouched\n" : directory.Read("whole")))
                << command << kilobytes;
        }
    }
}

TEST_F(BadInput, CarriageReturnsAreNone) {
    ASSERT_EQ(Merge(), 0);
    const std::string merged = directory.Read("dest.ovrin");
    ASSERT_NE(merged, "untouched\n");
    for (const char* name : {"base.ovrin", "left.ovrin", "right.ovrin"})
        directory.Run(std::string("sed -i 's/$/\\r/' ") + name);
    EXPECT_NE(directory.Read("left.ovrin").find("\r\n"), std::string::npos);
    EXPECT_EQ(Merge(), 0);
    EXPECT_EQ(directory.Read("dest.ovrin"), merged);
}

/// Merges a folder of Examples in an empty directory, with the report in "report".
int MergeExample(const program::WorkingDirectory& directory, const std::string& folder) {
    const std::string scene = OVRIN_SOURCE_DIR "/" + folder;
    return directory.Run("$OVRIN merge --fallback none -o report " + scene + "/base.ovrin " + scene +
                         "/left.ovrin " + scene + "/right.ovrin merged.ovrin");
}

TEST(Examples, TheFirstHasOneConflict) {
    const program::WorkingDirectory directory;
    EXPECT_EQ(MergeExample(directory, "Examples"), 2);
    EXPECT_EQ(directory.Read("report"), "Conflicts:\n"
                                        "Left  734813.MonoBehaviour.m_Brightness change to 6\n...\n"
                                        "Right 734813.MonoBehaviour.m_Brightness change to 2.5\n...\n"
                                        "Conflict handling:\n");
}

TEST(Examples, TheSecondHasALoopAndAnIdGivenTwice) {
    const program::WorkingDirectory directory;
    EXPECT_EQ(MergeExample(directory, "Examples/hierarchy"), 2);
    EXPECT_EQ(directory.Read("report"), "Conflicts:\n"
                                        "BreakCycle  201.Transform.m_Father.fileID \n"
                                        "BreakCycle  301.Transform.m_Father.fileID \n"
                                        "Conflict handling:\n");
    const std::string merged = directory.Read("merged.ovrin");
    EXPECT_NE(merged.find("--- !o!108 &400\nLight:"), std::string::npos);
    EXPECT_NE(merged.find("--- !o!82 &401\nAudioSource:"), std::string::npos);
    EXPECT_NE(merged.find("- component: {fileID: 401}"), std::string::npos);
}

} // namespace
