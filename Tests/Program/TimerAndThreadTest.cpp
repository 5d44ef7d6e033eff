#include "Session/Thread.h"
#include "TimerStat.h"
#include "Values/YAMLError.h"

#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

namespace {

using ovrin_yaml::Thread;

/// The lines without the times, which are bare numbers.
std::string Stages(const std::ostringstream& output) {
    std::string text = output.str();
    std::erase_if(text, [](char c) { return c >= '0' && c <= '9'; });
    return text;
}

TEST(TimerStat, StagesPrintAtTheirEndBelowTheirParent) {
    std::ostringstream output;
    {
        TimerStat root("Merging", &output);
        TimerStat stage(root, "Read files");
        { TimerStat step(stage, "Read base"); }
        EXPECT_EQ(Stages(output), "    Read base: \n");
    }
    EXPECT_EQ(Stages(output), "    Read base: \n  Read files: \nMerging: \n");
    EXPECT_NE(output.str(), Stages(output)) << "without times";
}

TEST(TimerStat, ARootWithoutOutputSilencesItsStages) {
    testing::internal::CaptureStdout();
    {
        TimerStat root("Merging", nullptr);
        TimerStat stage(root, "Read files");
    }
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "");
}

TEST(Thread, TheJoiningThreadGetsTheExceptionAsItWas) {
    Thread failed([] { throw ovrin_yaml::YAMLError("Cannot open file"); });
    Thread odd([] { throw 7; });
    Thread fine([] {});
    for (Thread* thread : {&failed, &odd, &fine}) thread->Join();
    EXPECT_THROW(failed.CheckForExceptions(), ovrin_yaml::YAMLError);
    EXPECT_THROW(odd.CheckForExceptions(), int);
    EXPECT_NO_THROW(fine.CheckForExceptions());
}

TEST(Thread, RunningThreadsMayMove) {
    std::vector<int> results(20);
    std::vector<Thread> threads;
    for (int& result : results) threads.push_back(Thread([&result] { result = 1; }));
    for (Thread& thread : threads) thread.Join();
    EXPECT_EQ(results, std::vector<int>(20, 1));
}

} // namespace
