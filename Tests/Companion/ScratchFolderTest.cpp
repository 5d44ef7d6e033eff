#include "Systems/ScratchFolder.h"

#include "ErrorOf.h"
#include "Support/Surroundings.h"
#include "Systems/ChildProcess.h"
#include "Words/Failure.h"

#include <csignal>
#include <gtest/gtest.h>
#include <unistd.h>

namespace {

using namespace ovrin;
namespace fs = std::filesystem;

struct ScratchFolderTest : testing::Test {
    bool IsEmpty() const { return fs::is_empty(place.Path()); }

    const program::WorkingDirectory place;
    const surroundings::Variable variable{"TMPDIR", place.Path().string()};
};

TEST_F(ScratchFolderTest, StandsInTheNamedPlaceForItsUserAlone) {
    const ScratchFolder scratch;
    const fs::path folder = scratch.NewFolder("inner");
    EXPECT_EQ(folder.parent_path().parent_path(), place.Path());
    for (const fs::path& each : {folder, folder.parent_path()})
        EXPECT_EQ(fs::status(each).permissions(), fs::perms::owner_all);
}

TEST_F(ScratchFolderTest, GoesWithAllThatIsInIt) {
    {
        const ScratchFolder scratch;
        place.Write(fs::relative(scratch.File("a"), place.Path()).string(), "text");
        place.Write(fs::relative(scratch.NewFolder("b") + "/c", place.Path()).string(), "text");
        EXPECT_FALSE(IsEmpty());
    }
    EXPECT_TRUE(IsEmpty());
}

TEST_F(ScratchFolderTest, FailureNamesThePlaceAndTheCure) {
    const surroundings::Variable nowhere("TMPDIR", "/nowhere");
    const std::string failure = failures::ErrorOf<Failure>([] { ScratchFolder(); });
    EXPECT_EQ(failure,
              "Cannot make a folder in /nowhere: No such file or directory.\nTMPDIR may name another place");
    const surroundings::Variable back("TMPDIR", place.Path().string());
    const ScratchFolder scratch;
    scratch.NewFolder("a");
    EXPECT_THROW(scratch.NewFolder("a"), Failure);
}

/// What a process ends with that makes a folder, and gets the signal while it has it.
int StatusAfter(int signal) {
    const pid_t child = fork();
    if (child == 0) {
        {
            const ScratchFolder scratch;
            raise(signal);
        }
        _exit(0);
    }
    return WaitForProcess(child);
}

TEST_F(ScratchFolderTest, SignalEndsTheProgramWhenTheFolderIsGone) {
    for (const int signal : {SIGINT, SIGTERM, SIGHUP}) {
        EXPECT_EQ(StatusAfter(signal), 128 + signal);
        EXPECT_TRUE(IsEmpty());
    }
    std::signal(SIGHUP, SIG_IGN); // as under nohup
    EXPECT_EQ(StatusAfter(SIGHUP), 0);
    std::signal(SIGHUP, SIG_DFL);
}

} // namespace
