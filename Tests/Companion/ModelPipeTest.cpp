#include "WebGate/Server/ModelPipe.h"

#include "Descriptor.h"
#include "WebGate/Server/OpenPages.h"

#include <gtest/gtest.h>
#include <sys/socket.h>
#include <thread>

namespace {

using namespace ovrin;

struct ModelPipeTest : testing::Test {
    ModelPipeTest() {
        int ends[2];
        EXPECT_EQ(socketpair(AF_UNIX, SOCK_STREAM, 0, ends), 0);
        model = Descriptor(ends[0]);
        there = Descriptor(ends[1]);
        pipe.emplace(there.Get());
        taker = std::thread([&] { pipe->TakeAnswers(); });
    }
    ~ModelPipeTest() override {
        model.Close();
        if (taker.joinable()) taker.join();
    }
    WebFrame Heard() const { return ReceiveFrame(model.Get(), kMostRequestFrame).value_or(WebFrame()); }
    void Answer(const std::string& body) const {
        EXPECT_TRUE(SendFrame(model.Get(), {"answer", "200", "text/plain", body, ""}));
    }

    Descriptor model, there;
    std::optional<ModelPipe> pipe;
    std::thread taker;
};

TEST_F(ModelPipeTest, WhoeverAsksGetsItsOwnAnswer) {
    constexpr int kThreads = 8, kRequests = 50;
    std::vector<std::thread> askers;
    for (int thread = 0; thread < kThreads; ++thread)
        askers.emplace_back([&, thread] {
            for (int i = 0; i < kRequests; ++i) {
                const std::string text =
                    std::to_string(thread) + std::string(static_cast<std::size_t>(i) * 40, 'x');
                EXPECT_EQ(pipe->Ask({"request", text}).at(3), text);
                pipe->Tell({"pages", text});
            }
        });
    int requests = 0;
    for (int frames = 0; frames < 2 * kThreads * kRequests; ++frames) {
        const WebFrame frame = Heard();
        ASSERT_EQ(frame.size(), 2);
        if (frame[0] != "request") continue;
        Answer(frame[1]);
        ++requests;
    }
    for (std::thread& asker : askers) asker.join();
    EXPECT_EQ(requests, kThreads * kRequests);
}

TEST_F(ModelPipeTest, WhatIsNoAnswerEndsThePipe) {
    for (const WebFrame& frame : {WebFrame{}, WebFrame{"answer", "200", "text/plain", ""},
                                  WebFrame{"answer", "200", "text/plain", "", "", ""},
                                  WebFrame{"Answer", "200", "text/plain", "", ""}}) {
        EXPECT_TRUE(SendFrame(model.Get(), frame));
        taker.join();
        taker = std::thread([&] { pipe->TakeAnswers(); });
    }
    Answer("to no question");
    taker.join();
}

TEST_F(ModelPipeTest, PagesAreCountedUpToABound) {
    OpenPages pages(*pipe);
    for (int page = 1; page <= 16; ++page) {
        EXPECT_TRUE(pages.Enter());
        EXPECT_EQ(Heard(), (WebFrame{"pages", std::to_string(page)}));
    }
    EXPECT_FALSE(pages.Enter());
    pages.Leave();
    EXPECT_EQ(Heard(), (WebFrame{"pages", "15"}));
    EXPECT_TRUE(pages.Enter());
}

} // namespace
