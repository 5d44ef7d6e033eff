#include "WebGate/Server/RequestReader.h"

#include "Descriptor.h"

#include <gtest/gtest.h>
#include <sys/socket.h>
#include <thread>

namespace {

using namespace ovrin;
using Clock = std::chrono::steady_clock;

const std::string kHead = "POST /a HTTP/1.1\r\nHost: b\r\n\r\n", kBody = "{\n\n\"c\":\r\n\r\n1}";
constexpr std::size_t kMostHead = 16384;

struct RequestReaderTest : testing::Test {
    RequestReaderTest() { Connect(SOCK_SEQPACKET); }
    /// By packets, each of which arrives as one piece; or by a stream.
    void Connect(int type) {
        int ends[2];
        ASSERT_EQ(socketpair(AF_UNIX, type, 0, ends), 0);
        here = Descriptor(ends[0]);
        there = Descriptor(ends[1]);
    }
    void Send(std::string_view piece) const {
        ASSERT_EQ(send(there.Get(), piece.data(), piece.size(), MSG_NOSIGNAL),
                  static_cast<ssize_t>(piece.size()));
    }
    /// What is read of a request that came in these pieces, after which the other side closed.
    std::optional<std::string> HeadOf(const std::vector<std::string>& pieces) {
        Connect(SOCK_SEQPACKET);
        for (const std::string& piece : pieces) Send(piece);
        there.Close();
        return RequestReader(here.Get()).Head();
    }

    Descriptor here, there;
};

TEST_F(RequestReaderTest, RequestIsTheSameInAnyPieces) {
    const std::string all = kHead + kBody;
    for (std::size_t first = 1; first < all.size(); ++first)
        for (std::size_t second = first; second < all.size(); ++second) {
            Connect(SOCK_SEQPACKET);
            Send(all.substr(0, first));
            if (second > first) Send(all.substr(first, second - first));
            Send(all.substr(second));
            RequestReader reader(here.Get());
            ASSERT_EQ(reader.Head(), kHead) << first << " " << second;
            ASSERT_EQ(reader.Body(kBody.size()), kBody) << first << " " << second;
        }
}

TEST_F(RequestReaderTest, BodyIsAsLongAsItsHeadSaid) {
    Send(kHead + kBody + kHead);
    RequestReader reader(here.Get());
    EXPECT_EQ(reader.Head(), kHead);
    EXPECT_EQ(reader.Body(0), ""); // without waiting for one
    EXPECT_EQ(reader.Body(kBody.size()), kBody);
    there.Close();
    EXPECT_EQ(reader.Body(kBody.size() + kHead.size()), kBody + kHead);
    EXPECT_FALSE(reader.Body(kBody.size() + kHead.size() + 1));
}

TEST_F(RequestReaderTest, WhatIsCutIsNoHead) {
    for (std::size_t length = 1; length < kHead.size(); ++length)
        EXPECT_FALSE(HeadOf({kHead.substr(0, length)})) << length;
    EXPECT_FALSE(HeadOf({}));
    EXPECT_EQ(HeadOf({"\r\n\r\n"}), "\r\n\r\n");
}

TEST_F(RequestReaderTest, NothingIsAwaitedBehindOtherLineEnds) {
    for (const char* text : {"GET / HTTP/1.1\nHost: a\n\n", "\n\n", "a\r\n\n\nb"})
        for (std::size_t split = 1; split < std::string(text).size(); ++split) {
            Connect(SOCK_SEQPACKET);
            Send(std::string(text).substr(0, split));
            Send(std::string(text).substr(split));
            RequestReader reader(here.Get());
            EXPECT_EQ(reader.Head().value_or("nothing").find("\r\n\r\n"), std::string::npos) << text << split;
        }
}

TEST_F(RequestReaderTest, HeadHasItsBoundToTheByte) {
    const auto head = [](std::size_t length) { return std::string(length - 4, 'x') + "\r\n\r\n"; };
    for (const std::size_t piece : {std::size_t{4096}, std::size_t{4000}, std::size_t{1000}})
        for (const std::size_t length : {kMostHead - 1, kMostHead, kMostHead + 1, kMostHead + 4}) {
            std::vector<std::string> pieces;
            const std::string all = head(length) + kBody;
            for (std::size_t at = 0; at < all.size(); at += piece) pieces.push_back(all.substr(at, piece));
            EXPECT_EQ(HeadOf(pieces).has_value(), length <= kMostHead) << piece << " " << length;
        }
    EXPECT_FALSE(HeadOf(std::vector<std::string>(5, std::string(4096, 'x'))));
}

TEST_F(RequestReaderTest, AnswerArrivesWholeOrIsGivenUp) {
    Connect(SOCK_STREAM);
    const std::string answer(5000000, 'x');
    std::string got;
    std::thread reader([&] {
        char buffer[70000];
        for (ssize_t count = 1; (count = recv(there.Get(), buffer, sizeof(buffer), 0)) > 0;)
            got.append(buffer, static_cast<std::size_t>(count));
    });
    EXPECT_TRUE(
        SendInTime(here.Get(), answer.data(), answer.size(), Clock::now() + std::chrono::seconds(30)));
    FinishSending(here.Get());
    reader.join();
    EXPECT_EQ(got, answer);

    Connect(SOCK_STREAM);
    const auto soon = Clock::now() + std::chrono::milliseconds(50);
    EXPECT_FALSE(SendInTime(here.Get(), answer.data(), answer.size(), soon)); // which nobody reads
    EXPECT_FALSE(SendInTime(here.Get(), "x", 1, Clock::now()));
    there.Close();
    EXPECT_FALSE(SendInTime(here.Get(), "x", 1, Clock::now() + std::chrono::seconds(30)));
}

} // namespace
