#include "WebGate/WebFrame.h"

#include "Descriptor.h"

#include <cstdint>
#include <gtest/gtest.h>
#include <sys/socket.h>
#include <thread>
#include <unistd.h>

namespace {

using namespace ovrin;

struct WebFrameTest : testing::Test {
    WebFrameTest() {
        int ends[2];
        EXPECT_EQ(socketpair(AF_UNIX, SOCK_STREAM, 0, ends), 0);
        here = Descriptor(ends[0]);
        there = Descriptor(ends[1]);
    }
    /// What is received of these numbers and bytes.
    std::optional<WebFrame> Received(const std::vector<std::uint32_t>& numbers, const std::string& bytes) {
        EXPECT_GT(write(here.Get(), numbers.data(), numbers.size() * sizeof(numbers[0])), 0);
        EXPECT_EQ(write(here.Get(), bytes.data(), bytes.size()), static_cast<ssize_t>(bytes.size()));
        here.Close();
        return ReceiveFrame(there.Get(), 100);
    }

    Descriptor here, there;
};

TEST_F(WebFrameTest, AnyBytesOfAnyLengthArrive) {
    const WebFrame sent = {"", std::string("\0\xff", 2), std::string(3000000, 'x'), ""};
    std::thread sender([&] { EXPECT_TRUE(SendFrame(here.Get(), sent)); });
    EXPECT_EQ(ReceiveFrame(there.Get(), 4000000), sent);
    sender.join();
    there.Close();
    EXPECT_FALSE(SendFrame(here.Get(), sent));
}

TEST_F(WebFrameTest, WhatIsCutIsNoFrame) {
    EXPECT_FALSE(Received({10, 6}, "abc"));
}

TEST_F(WebFrameTest, LengthsThatLeadOutAreNoFrame) {
    EXPECT_FALSE(Received({8, 5}, "abcd"));
}

TEST_F(WebFrameTest, FrameThatIsCutAnywhereIsNone) {
    const WebFrame sent = {"ab", "", std::string(10, '\0')};
    EXPECT_TRUE(SendFrame(here.Get(), sent));
    std::string bytes(100, '\0');
    bytes.resize(static_cast<std::size_t>(read(there.Get(), bytes.data(), bytes.size())));
    for (std::size_t length = 0; length <= bytes.size(); ++length) {
        int ends[2];
        ASSERT_EQ(socketpair(AF_UNIX, SOCK_STREAM, 0, ends), 0);
        Descriptor from(ends[0]);
        const Descriptor to(ends[1]);
        EXPECT_EQ(write(from.Get(), bytes.data(), length), static_cast<ssize_t>(length));
        from.Close();
        EXPECT_EQ(ReceiveFrame(to.Get(), 100), length == bytes.size() ? std::optional(sent) : std::nullopt);
    }
}

TEST_F(WebFrameTest, FramesFollowEachOtherUpToTheirBound) {
    const WebFrame longest = {std::string(96, 'x')}, tooLong = {std::string(97, 'x')};
    for (const WebFrame& frame : {WebFrame{}, WebFrame{""}, longest, tooLong})
        EXPECT_TRUE(SendFrame(here.Get(), frame));
    EXPECT_EQ(ReceiveFrame(there.Get(), 100), WebFrame{});
    EXPECT_EQ(ReceiveFrame(there.Get(), 100), WebFrame{""});
    EXPECT_EQ(ReceiveFrame(there.Get(), 100), longest);
    EXPECT_FALSE(ReceiveFrame(there.Get(), 100));
}

TEST_F(WebFrameTest, LengthOfATextIsWithinItsFrame) {
    EXPECT_FALSE(Received({12, 0xFFFFFFFF}, "abcdefgh"));
}

TEST_F(WebFrameTest, WhatIsTooLongIsNotWaitedFor) {
    EXPECT_FALSE(Received({101}, ""));
}

} // namespace
