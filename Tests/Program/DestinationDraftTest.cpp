#include "DestinationDraft.h"

#include "CommandSettings.h"
#include "Destination.h"
#include "FileUtils.h"
#include "MergePipeline.h"

#include "Support/Program.h"

#include <gtest/gtest.h>

#include <fcntl.h>
#include <fstream>
#include <sys/stat.h>

namespace {

using namespace program;

/// A result that is written in steps, with a draft that follows from the first byte on.
struct DestinationDrafts : testing::Test {
    std::string Path(const std::string& name) const { return (folder.Path() / name).string(); }

    void Append(const std::string& text) {
        std::ofstream(Path("result"), std::ios::app) << text;
        m_Length += text.size();
    }
    void Follow(DestinationDraft& draft) const { draft.Follow(Path("result"), m_Length); }
    /// Some megabytes, so that the copy is behind at times.
    void WriteInSteps(DestinationDraft& draft) {
        for (std::size_t step = 0; step < 200; ++step) {
            Append(std::string(1 + step * 7919 % 40'000, static_cast<char>('a' + step % 26)));
            Follow(draft);
        }
    }
    int Deliver(DestinationDraft& draft, const std::string& dest = "to/file") const {
        return OutputResultToDestination(Path("result"), Path(dest), &draft);
    }
    std::size_t CountFiles() const {
        return static_cast<std::size_t>(std::distance(fs::directory_iterator(folder.Path() / "to"), {}));
    }
    static std::size_t CountDescriptors() {
        return static_cast<std::size_t>(std::distance(fs::directory_iterator("/proc/self/fd"), {}));
    }
    void ExpectDelivered(const std::string& dest = "to/file") const {
        EXPECT_TRUE(folder.Read(dest) == folder.Read("result"));
        EXPECT_EQ(CountFiles(), 1u);
    }

    const WorkingDirectory folder;

    void StartAgain() {
        fs::remove(folder.Path() / "result");
        m_Length = 0;
        folder.Write("to/file", "old");
        fs::permissions(folder.Path() / "to/file", fs::perms(0741));
    }

private:
    void SetUp() override { StartAgain(); }

    std::size_t m_Length = 0;
};

TEST_F(DestinationDrafts, BecomeTheDestination) {
    DestinationDraft draft(Path("to/file"), 1);
    WriteInSteps(draft);
    ASSERT_EQ(folder.Read("to/file"), "old");
    ASSERT_EQ(CountFiles(), 1u) << "it has no name";
    const Descriptor result = OpenFile(Path("result").c_str(), O_RDONLY);
    const Descriptor old = OpenFile(Path("to/file").c_str(), O_WRONLY);
    EXPECT_TRUE(draft.Complete(result));
    EXPECT_TRUE(draft.TakePlace(Path("to/file"), old, Durability::Synced));
    ExpectDelivered();
    EXPECT_EQ(fs::status(folder.Path() / "to/file").permissions(), fs::perms(0741));
    EXPECT_FALSE(draft.GiveUp()) << "there is none any more";
}

TEST_F(DestinationDrafts, AreDeliveredThroughLinks) {
    fs::create_symlink("to/file", folder.Path() / "link");
    DestinationDraft draft(Path("link"), 1);
    WriteInSteps(draft);
    EXPECT_EQ(Deliver(draft, "link"), 0);
    ExpectDelivered();
    EXPECT_TRUE(fs::is_symlink(folder.Path() / "link"));
}

/// Whoever changed the result behind the draft's back gets what the result is now.
TEST_F(DestinationDrafts, AreGivenUpForAnotherResult) {
    const auto changes = {
        +[](const DestinationDrafts& test) { test.folder.Write("result", "short"); },
        +[](const DestinationDrafts& test) {
            std::ofstream(test.Path("result"), std::ios::app) << "more than was told";
        },
        +[](const DestinationDrafts& test) {
            fs::rename(test.Path("result"), test.Path("before"));
            test.folder.Write("result", std::string(fs::file_size(test.Path("before")), 'z'));
        },
    };
    for (const auto change : changes) {
        DestinationDraft draft(Path("to/file"), 1);
        WriteInSteps(draft);
        change(*this);
        EXPECT_EQ(Deliver(draft), 0);
        ExpectDelivered();
        StartAgain();
    }
}

TEST_F(DestinationDrafts, AreGivenUpForAnotherDestination) {
    DestinationDraft draft(Path("to/file"), 1);
    WriteInSteps(draft);
    fs::rename(folder.Path() / "to/file", folder.Path() / "real");
    fs::create_symlink("../real", folder.Path() / "to/file");
    EXPECT_EQ(Deliver(draft), 0);
    EXPECT_TRUE(fs::is_symlink(folder.Path() / "to/file"));
    ExpectDelivered("real");
}

TEST_F(DestinationDrafts, LeaveNothingWithoutADelivery) {
    {
        DestinationDraft draft(Path("to/file"), 1);
        WriteInSteps(draft);
        EXPECT_TRUE(draft.GiveUp());
        Follow(draft);
        EXPECT_FALSE(draft.GiveUp()) << "it doesn't begin again";
        DestinationDraft other(Path("to/file"), 1);
        Follow(other);
    }
    EXPECT_EQ(folder.Read("to/file"), "old");
    EXPECT_EQ(CountFiles(), 1u);
}

TEST_F(DestinationDrafts, AreMadeForBigResultsAndPlainFilesAlone) {
    Append("a small result");
    fs::create_hard_link(folder.Path() / "to/file", folder.Path() / "name");
    mkfifo(Path("pipe").c_str(), 0600);
    for (const char* dest : {"to/file", "pipe", "none", "to", "none/file"}) {
        DestinationDraft draft(Path(dest), 1);
        Follow(draft);
        EXPECT_FALSE(draft.GiveUp()) << dest;
    }
    fs::remove(folder.Path() / "name");
    DestinationDraft small(Path("to/file"), 1000);
    Follow(small);
    EXPECT_FALSE(small.GiveUp());
    EXPECT_EQ(Deliver(small), 0);
    ExpectDelivered();
}

/// The disk may not have room for both.
TEST_F(DestinationDrafts, MakeRoomForWhatIsWrittenInTheirStead) {
    const auto changes = {
        +[](const fs::path& file) { fs::create_hard_link(file, file.parent_path() / "name"); },
        +[](const fs::path& file) { fs::remove(file); },
    };
    for (const auto change : changes) {
        DestinationDraft draft(Path("to/file"), 1);
        WriteInSteps(draft);
        ASSERT_TRUE(draft.Complete(OpenFile(Path("result").c_str(), O_RDONLY)));
        change(Path("to/file"));
        const auto write = [&](OutputStream& stream) {
            EXPECT_FALSE(draft.GiveUp());
            stream << "new";
        };
        EXPECT_EQ(::Deliver(Path("to/file"), {3, write, Durability::Synced, &draft}), 0);
        EXPECT_EQ(folder.Read("to/file"), "new");
        fs::remove_all(folder.Path() / "to");
        StartAgain();
    }
}

TEST_F(DestinationDrafts, DontFollowAResultThatComesBeforePremergedFiles) {
    for (const char* side : {"base", "left", "right"})
        folder.Write(side, "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n--- !o!1 &1\nGameObject:\n  m_Name: " +
                               std::string(side) + '\n');
    folder.Write("rules", "");
    MergeConfig config;
    config.baseFile = Path("base");
    config.leftFile = Path("left");
    config.rightFile = Path("right");
    config.destFile = Path("to/file");
    config.conflictFile = Path("report");
    config.rulesFile = Path("rules");
    config.fallbackSpecFile = "none";
    const auto hasDraft = [&] {
        DestinationDraft draft(config.destFile, 1);
        EXPECT_EQ(HandleMergeCommand(config, Path("result"), &draft), ExitStatus::Conflicts);
        return draft.GiveUp();
    };
    EXPECT_TRUE(hasDraft());
    config.premergeBaseDest = Path("premerged base");
    config.premergeRightDest = Path("premerged right");
    EXPECT_FALSE(hasDraft());
}

/// The process may have none to spare for the delivery.
TEST_F(DestinationDrafts, KeepNoDescriptorOfTheResult) {
    const std::size_t before = CountDescriptors();
    DestinationDraft draft(Path("to/file"), 1);
    WriteInSteps(draft);
    EXPECT_EQ(CountDescriptors(), before + 2);
    EXPECT_TRUE(draft.Complete(OpenFile(Path("result").c_str(), O_RDONLY)));
    EXPECT_EQ(CountDescriptors(), before + 1);
    EXPECT_TRUE(draft.GiveUp());
    DestinationDraft inVain("/proc/self/comm", 1); // where no files can be made
    Follow(inVain);
    EXPECT_EQ(CountDescriptors(), before);
}

} // namespace
