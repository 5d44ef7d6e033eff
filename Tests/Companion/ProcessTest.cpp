#include "Systems/Process.h"

#include "ErrorOf.h"
#include "Support/Surroundings.h"
#include "Systems/ChildProcess.h"
#include "Words/Failure.h"

#include <gtest/gtest.h>
#include <numeric>

namespace {

using namespace ovrin;
using failures::ErrorOf;
using surroundings::FakePrograms;
using surroundings::Variable;

int StatusOf(const std::string& script) {
    return RunProcess({"sh", "-c", script}).status;
}

TEST(Process, TalksWithMoreThanAPipeHolds) {
    const std::string text(std::size_t{1} << 20, 'x');
    EXPECT_EQ(OutputOf({"cat"}, {.input = text}), text);
    EXPECT_EQ(OutputOf({"true"}, {.input = text}), "");
}

TEST(Process, BothOutputsMayBeLongWhileTheInputIsLongToo) {
    std::string text(std::size_t{1} << 20, '\0');
    std::iota(text.begin(), text.end(), '\0');
    const ProcessResult result = RunProcess({"sh", "-c", "tee /dev/stderr"}, {.input = text});
    EXPECT_TRUE(result.output == text);
    EXPECT_TRUE(result.errors == text);
}

TEST(Process, TellsHowItEnded) {
    const ProcessResult result = RunProcess({"sh", "-c", "pwd; echo $WORD >&2; kill -9 $$"},
                                            {.folder = "/", .environment = {{"WORD", "told"}}});
    EXPECT_EQ(result.status, 128 + 9);
    EXPECT_EQ(result.output + result.errors, "/\ntold\n");
    EXPECT_THROW(OutputOf({"false"}), Failure);
    EXPECT_THROW(RunProcess({"/nowhere/program"}), Failure);
    EXPECT_THROW(RunProcess({"true"}, {.folder = "/nowhere"}), Failure);
}

TEST(Process, StatusIsThatOfTheProgramOrOfTheSignal) {
    for (const int status : {0, 1, 2, 127, 129, 255})
        EXPECT_EQ(StatusOf("exit " + std::to_string(status)), status);
    for (const int signal : {SIGHUP, SIGTERM, SIGSEGV, SIGPIPE})
        EXPECT_EQ(StatusOf("kill -" + std::to_string(signal) + " $$"), 128 + signal);
}

TEST(Process, OutputsOfOneThatFailsAreWhole) {
    const ProcessResult result = RunProcess({"sh", "-c", "echo said; echo complained >&2; exit 3"});
    EXPECT_EQ(result.status, 3);
    EXPECT_FALSE(result.Succeeded());
    EXPECT_EQ(result.output + result.errors, "said\ncomplained\n");
}

TEST(Process, WordsReachAProgramAsTheyAre) {
    const CommandWords words = {"",   " ",  "*",  "$HOME",    "a\nb", "'",
                                "\"", "\\", "-n", "\xff\xfe", "ä",    "$(false)"};
    CommandWords command = {"printf", "%s\\0"};
    command.insert(command.end(), words.begin(), words.end());
    EXPECT_EQ(ZeroEndedTexts(OutputOf(command)), words);
}

TEST(Process, VariablesTakeThePlaceOfThoseOfTheirNameAlone) {
    const Variable one("OVRIN_TEST_ONE", "1"), longer("OVRIN_TEST_ONE_MORE", "2");
    const std::string told =
        OutputOf({"sh", "-c", "echo $OVRIN_TEST_ONE,$OVRIN_TEST_ONE_MORE,$OVRIN_TEST_NEW"},
                 {.environment = {{"OVRIN_TEST_ONE", "a=b"}, {"OVRIN_TEST_NEW", ""}}});
    EXPECT_EQ(told, "a=b,2,\n");
    EXPECT_STREQ(std::getenv("OVRIN_TEST_ONE"), "1");
}

TEST(Process, ErrorsThatAreShownAreNotKept) {
    testing::internal::CaptureStderr();
    const ProcessResult result = RunProcess({"sh", "-c", "echo shown >&2"}, {.showErrors = true});
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "shown\n");
    EXPECT_EQ(result.errors, "");
}

/// As a shell starts programs, whatever this process does with its signals.
TEST(Process, ProgramEndsAtAPipeThatNobodyReads) {
    EXPECT_EQ(OutputOf({"sh", "-c", "{ yes; echo $? >&2; } | head -n 1"}), "y\n");
}

TEST(Process, FailureTellsTheCommandItsStatusAndItsWords) {
    EXPECT_EQ(ErrorOf<Failure>([] {
                  OutputOf({"sh", "-c", "echo why >&2; exit 7"});
              }),
              "\"sh -c echo why >&2; exit 7\" failed with status 7:\nwhy\n");
    EXPECT_EQ(ErrorOf<Failure>([] { OutputOf({"false"}); }), "\"false\" failed with status 1");
    EXPECT_EQ(ErrorOf<Failure>([] { RunProcess({"ovrin-is-not-there"}); }),
              "Cannot start ovrin-is-not-there: No such file or directory");
}

TEST(Process, StreamsMayBeThoseOfTheCaller) {
    Pipe output;
    const pid_t child = StartProcess({"sh", "-c", "echo said; exit 5"}, {},
                                     {STDIN_FILENO, output.write.Get(), STDERR_FILENO});
    output.write.Close();
    char bytes[16];
    EXPECT_EQ(read(output.read.Get(), bytes, sizeof(bytes)), 5);
    EXPECT_EQ(WaitForProcess(child), 5);
}

TEST(ZeroEndedTexts, AreWhatWasListedAndNothingThatWasCutOff) {
    const std::vector<std::vector<std::string>> lists = {{}, {""}, {"a"}, {"", "", ""}, {"a\nb", "\xff", ""}};
    for (const std::vector<std::string>& list : lists) {
        std::string listed;
        for (const std::string& text : list) listed += text + '\0';
        EXPECT_EQ(ZeroEndedTexts(listed), list);
        EXPECT_EQ(ZeroEndedTexts(listed + "cut off"), list);
    }
}

TEST(FindProgram, TakesTheFirstThatCanBeRun) {
    const program::WorkingDirectory folder;
    folder.Write("a/tool", "text");
    folder.Write("b/tool", "#!/bin/sh\n");
    std::filesystem::permissions(folder.Path() / "b/tool", std::filesystem::perms::owner_all);
    const std::string place = folder.Path().string();
    const Variable path("PATH", "/nowhere:" + place + "/a:" + place + "/b");
    EXPECT_EQ(FindProgram("tool"), place + "/b/tool");
    EXPECT_EQ(FindProgram("another"), "");
}

TEST(FakePrograms, SayWhatTheyAreToldAndKeepTheirCalls) {
    FakePrograms programs;
    programs.Say("git", "diff", std::string("a\0b", 3));
    programs.Say("git", "", "else\n", 4);
    EXPECT_EQ(OutputOf({"git", "-c", "x/y", "diff"}), std::string("a\0b", 3));
    EXPECT_EQ(RunProcess({"git", "log"}).status, 4);
    EXPECT_EQ(programs.Calls(), "git -c x/y diff\ngit log\n");
}

} // namespace
