#include "Systems/ChildProcess.h"
#include "WebGate/WebFrame.h"

#include <arpa/inet.h>
#include <csignal>
#include <gtest/gtest.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <set>
#include <sys/socket.h>
#include <thread>
#include <unistd.h>
#include <utility>

namespace {

using namespace ovrin;

const std::string kToken = "0123456789abcdef0123456789abcdef";

/// Nothing that is read here is awaited for ever.
void LimitWaiting(int socket) {
    const timeval most{20, 0};
    setsockopt(socket, SOL_SOCKET, SO_RCVTIMEO, &most, sizeof(most));
}

/// The program that serves pages, whose model is this one.
struct Served {
    Served() {
        int ends[2];
        EXPECT_EQ(socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends), 0);
        model = Descriptor(ends[0]);
        LimitWaiting(model.Get());
        const Descriptor there(ends[1]);
        process =
            StartProcess({OVRIN_WEB_PROGRAM}, {.isApart = true}, {there.Get(), STDERR_FILENO, STDERR_FILENO});
    }
    Served(const Served&) = delete;
    Served& operator=(const Served&) = delete;
    ~Served() {
        if (process > 0) kill(process, SIGKILL);
        End();
    }

    void Send(const WebFrame& frame) const { EXPECT_TRUE(SendFrame(model.Get(), frame)); }
    WebFrame Heard() const { return ReceiveFrame(model.Get(), kMostRequestFrame).value_or(WebFrame()); }
    /// Whether the program has told anything.
    bool IsHeard() const {
        pollfd state{model.Get(), POLLIN, 0};
        return poll(&state, 1, 0) > 0;
    }
    void Answer(const std::string& body, const std::string& over = "") const {
        Send({"answer", "200", "text/plain", body, over});
    }
    /// The status with which it ends.
    int End() { return process > 0 ? WaitForProcess(std::exchange(process, 0)) : 0; }

    Descriptor model;
    pid_t process = 0;
};

struct GateServerTest : testing::Test, Served {
    void SetUp() override {
        Send({"serve", kToken, "0"});
        const WebFrame begun = Heard();
        ASSERT_EQ(begun.size(), 2);
        if (begun[0] == "failed") GTEST_SKIP() << begun[1];
        port = begun[1];
    }
    Descriptor Connect() const {
        Descriptor client(socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0));
        sockaddr_in address{};
        address.sin_family = AF_INET;
        address.sin_port = htons(static_cast<in_port_t>(std::stoi(port)));
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        EXPECT_EQ(connect(client.Get(), reinterpret_cast<sockaddr*>(&address), sizeof(address)), 0);
        const int yes = 1;
        setsockopt(client.Get(), IPPROTO_TCP, TCP_NODELAY, &yes, sizeof(yes));
        LimitWaiting(client.Get());
        return client;
    }
    Descriptor Asked(const std::string& request) const {
        Descriptor client = Connect();
        EXPECT_EQ(send(client.Get(), request.data(), request.size(), MSG_NOSIGNAL),
                  static_cast<ssize_t>(request.size()));
        return client;
    }
    static std::string AnswerTo(const Descriptor& client) {
        std::string answer;
        char buffer[65536];
        for (ssize_t count = 1; (count = recv(client.Get(), buffer, sizeof(buffer), 0)) > 0;)
            answer.append(buffer, static_cast<std::size_t>(count));
        return answer;
    }
    std::string Request(const std::string& method, const std::string& path, const std::string& more = "",
                        const std::string& token = kToken) const {
        return method + " /" + token + "/" + path + " HTTP/1.1\r\nHost: 127.0.0.1:" + port + "\r\n" + more +
               "\r\n";
    }
    std::string Posted(const std::string& path, const std::string& body) const {
        return Request("POST", path,
                       "Origin: http://127.0.0.1:" + port +
                           "\r\nContent-Type: application/json\r\nContent-Length: " +
                           std::to_string(body.size()) + "\r\n") +
               body;
    }

    std::string port;
};

bool IsAnswer(const std::string& answer, const std::string& status, const std::string& body) {
    return answer.starts_with("HTTP/1.1 " + status + " ") && answer.ends_with("\r\n\r\n" + body);
}

TEST_F(GateServerTest, ModelHearsWhatWasAskedAndNothingElse) {
    const std::string bytes("{\r\n\r\n\0\xff\"GET / HTTP/1.1\r\n\r\n", 26);
    const std::pair<std::string, WebFrame> requests[] = {
        {Request("GET", ""), {"request", "GET", "", ""}},
        {Request("GET", "api/x?b=2&a=%00%FF%26&c"),
         {"request", "GET", "api/x", "", "a", std::string("\0\xff&", 3), "b", "2", "c", ""}},
        {Request("GET", "api/x", "Range: bytes=0-1\r\nCookie: a\r\nX-Forwarded-For: b\r\nUpgrade: h2c\r\n"),
         {"request", "GET", "api/x", ""}},
        {Request("GET", std::string(4000, 'x')), {"request", "GET", std::string(4000, 'x'), ""}},
        {Posted("api/take?x=y", bytes), {"request", "POST", "api/take", bytes, "x", "y"}},
        {Posted("api/take", std::string(65536, '[')),
         {"request", "POST", "api/take", std::string(65536, '[')}}};
    for (const auto& [request, heard] : requests) {
        const Descriptor client = Asked(request);
        EXPECT_EQ(Heard(), heard);
        Answer("said");
        EXPECT_TRUE(IsAnswer(AnswerTo(client), "200", "said"));
    }
    const Descriptor client = Asked(Request("HEAD", "api/x"));
    EXPECT_EQ(Heard(), (WebFrame{"request", "GET", "api/x", ""}));
    Answer("said");
    EXPECT_TRUE(IsAnswer(AnswerTo(client), "200", ""));
}

TEST_F(GateServerTest, WhatIsCutReachesNobody) {
    const std::string whole = Posted("api/take", R"({"all":true})");
    for (std::size_t length = 0; length < whole.size(); ++length) {
        const Descriptor client = Asked(whole.substr(0, length));
        shutdown(client.Get(), SHUT_WR);
        EXPECT_EQ(AnswerTo(client), "") << length;
    }
    EXPECT_FALSE(IsHeard());
    const Descriptor client = Connect();
    for (const char byte : whole) EXPECT_EQ(send(client.Get(), &byte, 1, MSG_NOSIGNAL), 1);
    EXPECT_EQ(Heard().at(3), R"({"all":true})");
    Answer("said");
    EXPECT_TRUE(IsAnswer(AnswerTo(client), "200", "said"));
}

TEST_F(GateServerTest, EveryClientGetsTheAnswerToItsOwnRequest) {
    constexpr int kClients = 50;
    std::vector<Descriptor> clients;
    for (int i = 0; i < kClients; ++i)
        clients.push_back(Asked(Request("GET", "api/x?n=" + std::to_string(i))));
    std::set<std::string> heard;
    for (int i = 0; i < kClients; ++i) {
        const WebFrame frame = Heard();
        ASSERT_EQ(frame.size(), 6);
        heard.insert(frame[5]);
        Answer("this is " + frame[5]);
    }
    EXPECT_EQ(heard.size(), kClients);
    for (int i = 0; i < kClients; ++i)
        EXPECT_TRUE(
            IsAnswer(AnswerTo(clients[static_cast<std::size_t>(i)]), "200", "this is " + std::to_string(i)));
}

TEST_F(GateServerTest, RefusedRequestDoesNotWaitForTheModel) {
    const Descriptor waiting = Asked(Request("GET", "api/slow"));
    EXPECT_EQ(Heard().at(2), "api/slow");
    EXPECT_TRUE(AnswerTo(Asked(Request("GET", "", "", std::string(32, '0')))).starts_with("HTTP/1.1 404 "));
    EXPECT_TRUE(AnswerTo(Asked("GET / HTTP/1.1\r\n\r\n")).starts_with("HTTP/1.1 403 "));
    EXPECT_TRUE(AnswerTo(Asked("\r\n\r\n")).starts_with("HTTP/1.1 400 "));
    const Descriptor next = Asked(Request("GET", "api/next"));
    Answer("slow");
    EXPECT_EQ(Heard().at(2), "api/next");
    Answer("next");
    EXPECT_TRUE(IsAnswer(AnswerTo(waiting), "200", "slow"));
    EXPECT_TRUE(IsAnswer(AnswerTo(next), "200", "next"));
}

TEST_F(GateServerTest, LastAnswerArrivesWholeAheadOfTheEnd) {
    std::string body(20000000, '\0');
    for (std::size_t i = 0; i < body.size(); ++i) body[i] = static_cast<char>(i % 251);
    const Descriptor client = Asked(Posted("api/finish", "{}"));
    Heard();
    std::thread model([&] { Answer(body, "over"); });
    usleep(100000); // by then the answer fills all that is in between
    EXPECT_TRUE(IsAnswer(AnswerTo(client), "200", body));
    model.join();
    EXPECT_EQ(End(), 0);
}

TEST_F(GateServerTest, EndOfTheModelEndsTheServerWithAllThatWait) {
    const Descriptor page = Asked(Request("GET", "api/alive")), waiting = Asked(Request("GET", "api/slow"));
    while (Heard().at(0) != "request") {
    }
    model.Close();
    EXPECT_EQ(End(), 0);
    EXPECT_EQ(AnswerTo(waiting), "");
    EXPECT_EQ(AnswerTo(page).find("HTTP/1.1", 1), std::string::npos);
}

TEST_F(GateServerTest, AnswerThatNobodyAskedForEndsTheServer) {
    Answer("unasked");
    EXPECT_EQ(End(), 0);
}

TEST(GateServer, OrderThatIsNoneEndsIt) {
    const WebFrame orders[] = {
        {}, {"serve"}, {"serve", kToken}, {"Serve", kToken, "0"}, {"serve", kToken, "0", ""}};
    for (const WebFrame& order : orders) {
        Served served;
        served.Send(order);
        EXPECT_EQ(served.Heard(), WebFrame());
        EXPECT_EQ(served.End(), 1);
    }
    Served served;
    EXPECT_EQ(send(served.model.Get(), "\xff\xff\xff\xff", 4, 0), 4); // a length that nothing has
    EXPECT_EQ(served.End(), 1);
}

} // namespace
