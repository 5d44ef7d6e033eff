#include "Settle/MergedScene.h"

#include "ErrorOf.h"
#include "OpenScenes.h"
#include "Words/Failure.h"

#include <cerrno>
#include <csignal>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

using namespace open_scenes;

struct MergedSceneTest : testing::Test {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }
    ~MergedSceneTest() override {
        EXPECT_EQ(waitpid(-1, nullptr, WNOHANG), -1); // no process is left
        EXPECT_EQ(errno, ECHILD);
    }

    const std::unique_ptr<SettleSession> session = SessionOf(TwoConflicts());
};

TEST_F(MergedSceneTest, AnswersOfAnyLengthAndBytesAreWhole) {
    for (const std::size_t length : {0, 1, 7, 8, 9, 65535, 65536, 8 << 20}) {
        const std::string made(length, '\0');
        EXPECT_EQ(session->InMerged([&] { return made; }), made) << length;
        EXPECT_EQ(session->InMerged([&] { return "-" + made; }), "-" + made) << length;
    }
}

TEST_F(MergedSceneTest, EndOfItsProcessIsToldAndTheSessionGoesOn) {
    const auto failing = [&](const std::function<void()>& end) {
        return failures::ErrorOf<Failure>([&] { session->InMerged([&] { return (end(), std::string()); }); });
    };
    const std::string told = "The scene can't be merged: the process for it was ";
    EXPECT_EQ(failing([] { raise(SIGKILL); }), told + "killed by signal 9");
    EXPECT_EQ(failing([] { _exit(3); }), told + "ended with status 3");
    EXPECT_EQ(failing([] { throw std::runtime_error("x"); }), told + "ended with status 1");
    EXPECT_EQ(failing([] { throw Failure("there is no room"); }), "there is no room");
    session->Decide({{"20", Side::Theirs}});
    EXPECT_EQ(session->Open().size(), 1);
}

TEST_F(MergedSceneTest, StepWhoseMergeFailsLeavesTheSessionAsItWas) {
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
    GTEST_SKIP() << "sanitizers need descriptors to look at an exception";
#endif
    session->Decide({{"10.GameObject.m_Layer", Side::Theirs}});
    const std::string before = session->Result();
    // A descriptor is wanted for the process that merges.
    rlimit limit{};
    getrlimit(RLIMIT_NOFILE, &limit);
    const rlimit none{0, limit.rlim_max};
    setrlimit(RLIMIT_NOFILE, &none);
    EXPECT_THROW(session->Decide({{"20", Side::Theirs}}), Failure);
    EXPECT_THROW(session->TakeAll(Side::Base, [](const OpenConflict&) { return true; }), Failure);
    setrlimit(RLIMIT_NOFILE, &limit);
    EXPECT_EQ(session->Decisions().size(), 1);
    EXPECT_EQ(session->Open().size(), 1);
    EXPECT_EQ(session->Result(), before);
    EXPECT_TRUE(session->Undo() && !session->Undo() && session->Redo());
    EXPECT_EQ(session->Result(), before);
}

} // namespace
