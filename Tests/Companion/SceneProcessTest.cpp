#include "Review/SceneProcess.h"

#include "ErrorOf.h"
#include "Systems/ChildProcess.h"
#include "Words/Failure.h"

#include <csignal>
#include <gtest/gtest.h>
#include <sys/time.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

using namespace ovrin;
using failures::ErrorOf;
using Answer = SceneProcess::Answer;

const char* const kEnded = "The process for this scene came to its end: ask again";

/// Opens nothing, and answers so.
std::function<Answer()> Always(const Answer& answer) {
    return [answer] { return answer; };
}

PageAnswer Echo(const PageRequest& request) {
    std::string text = request.method + request.path;
    for (const auto& [key, value] : request.query) text += "|" + key + "=" + value;
    return {207, text, request.body};
}

std::string ErrorOfAsking(SceneProcess& process) {
    return ErrorOf<Failure>([&] { process.Ask({"GET", "", {}, ""}); });
}

/// Waits until all processes that have the pipe are gone.
bool AreAllGone(Pipe& pipe) {
    pipe.write.Close();
    char byte;
    return read(pipe.read.Get(), &byte, 1) == 0;
}

TEST(SceneProcess, RequestsAndAnswersAreOfAnyBytes) {
    SceneProcess process(Always(Echo));
    const std::string bytes("\0\xff\n=|", 5), body(300'000, '\xfe');
    const PageAnswer answer = process.Ask({"GET", bytes, {{"", bytes}, {bytes, ""}}, body});
    EXPECT_EQ(answer.status, 207);
    EXPECT_EQ(answer.type, "GET" + bytes + "|=" + bytes + "|" + bytes + "=");
    EXPECT_TRUE(answer.body == body);
    EXPECT_EQ(process.Ask({}).type, "");
}

TEST(SceneProcess, KeepsWhatItKnowsToItself) {
    int asked = 0;
    SceneProcess one(Always([&](const PageRequest&) { return PageAnswer{++asked, "", ""}; }));
    SceneProcess other(Always([&](const PageRequest&) { return PageAnswer{++asked, "", ""}; }));
    for (const int time : {1, 2, 3}) EXPECT_EQ(one.Ask({}).status, time);
    EXPECT_EQ(other.Ask({}).status, 1);
    EXPECT_EQ(asked, 0);
}

TEST(SceneProcess, AnyEndOfItIsToldHoweverOftenItIsAsked) {
    const std::vector<std::function<void()>> ends = {
        [] { kill(getpid(), SIGKILL); }, [] { _exit(0); }, [] { throw std::runtime_error("lost"); },
        [] { throw std::bad_alloc(); }, [] { kill(getpid(), SIGTERM); }};
    for (const auto& end : ends) {
        SceneProcess inOpen([&] { return end(), Answer(Echo); });
        SceneProcess inAnswer(Always([&](const PageRequest& request) { return end(), Echo(request); }));
        for (SceneProcess* process : {&inOpen, &inAnswer, &inOpen, &inAnswer})
            EXPECT_EQ(ErrorOfAsking(*process), kEnded);
    }
}

TEST(SceneProcess, RequestThatIsTooLongIsItsEnd) {
    SceneProcess process(Always(Echo));
    EXPECT_EQ(ErrorOf<Failure>([&] { process.Ask({"GET", "", {}, std::string(600'000, 'x')}); }), kEnded);
    EXPECT_EQ(ErrorOfAsking(process), kEnded);
}

TEST(SceneProcess, WhatCannotBeOpenedSaysSoEachTime) {
    SceneProcess process([]() -> Answer { throw Failure("a \"name\" \xff"); });
    for (int time = 0; time < 2; ++time) {
        const PageAnswer answer = process.Ask({});
        EXPECT_EQ(answer.status, 409);
        EXPECT_EQ(answer.body, R"({"error":"a \"name\" )"
                               "\xEF\xBF\xBD"
                               R"("})");
    }
}

TEST(SceneProcess, OneThatHangsIsEndedWithItsObject) {
    Pipe pipe;
    {
        SceneProcess inOpen([]() -> Answer {
            while (true) pause();
        });
        signal(SIGTERM, SIG_IGN);
        SceneProcess deaf([]() -> Answer {
            while (true) pause();
        });
        signal(SIGTERM, SIG_DFL);
    }
    EXPECT_TRUE(AreAllGone(pipe));
}

/// Who is killed can't end them.
TEST(SceneProcess, NoneOutlivesTheOneThatStartedIt) {
    Pipe pipe;
    const pid_t starter = fork();
    if (starter == 0) {
        SceneProcess one(Always(Echo)), two(Always(Echo)), three(Always(Echo));
        two.Ask({});
        kill(getpid(), SIGKILL);
    }
    EXPECT_EQ(WaitForProcess(starter), 128 + SIGKILL);
    EXPECT_TRUE(AreAllGone(pipe));
}

TEST(SceneProcess, SignalsInterruptNoQuestion) {
    struct sigaction act = {}, before;
    act.sa_handler = [](int) {};
    sigaction(SIGALRM, &act, &before);
    const itimerval often = {{0, 2000}, {0, 2000}}, never = {};
    SceneProcess process(Always([](const PageRequest& request) {
        usleep(20'000);
        return Echo(request);
    }));
    setitimer(ITIMER_REAL, &often, nullptr);
    const std::string body(400'000, 'x');
    for (int time = 0; time < 3; ++time)
        EXPECT_EQ(process.Ask({"GET", "", {}, body}).body.size(), body.size());
    setitimer(ITIMER_REAL, &never, nullptr);
    sigaction(SIGALRM, &before, nullptr);
}

} // namespace
