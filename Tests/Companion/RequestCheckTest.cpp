#include "WebGate/RequestCheck.h"

#include <cctype>
#include <gtest/gtest.h>

namespace {

using namespace ovrin;

const PageAddress kAddress{"0123456789abcdef0123456789abcdef", 8123};
const std::string kRoot = "/" + kAddress.token + "/", kHost = "Host: 127.0.0.1:8123\r\n";
const std::string kOrigin = "Origin: http://127.0.0.1:8123\r\n", kJson = "Content-Type: application/json\r\n";

std::variant<PassedRequest, RefusedRequest> Check(const std::string& text) {
    const std::optional<RequestHead> head = ParseRequestHead(text);
    return head ? CheckRequest(*head, kAddress) : RefusedRequest{0, "no request"};
}

/// The status with which a request is refused; 0 for what is no request, 200 for one that passes.
int StatusOf(const std::string& text) {
    const auto checked = Check(text);
    const auto* refused = std::get_if<RefusedRequest>(&checked);
    return refused ? refused->status : 200;
}

int StatusOfGet(const std::string& path, const std::string& headers = kHost) {
    return StatusOf("GET " + path + " HTTP/1.1\r\n" + headers + "\r\n");
}

int StatusOfPost(const std::string& headers) {
    return StatusOf("POST " + kRoot + "api/take HTTP/1.1\r\n" + kHost + headers + "\r\n");
}

TEST(RequestCheckTest, WhatPassesIsDecodedBelowTheToken) {
    const auto checked =
        Check("GET " + kRoot + "api/find?text=a%20b%00%C3%a4+c&empty=&none HTTP/1.1\r\n" + kHost + "\r\n");
    const auto& passed = std::get<PassedRequest>(checked);
    EXPECT_EQ(passed.path, "api/find");
    const std::vector<std::pair<std::string, std::string>> query = {
        {"text", std::string("a b\0\xC3\xA4 c", 8)}, {"empty", ""}, {"none", ""}};
    EXPECT_EQ(passed.query, query);
    EXPECT_EQ(StatusOfPost(kOrigin + kJson + "Content-Length: 65536\r\n"), 200);
    EXPECT_EQ(
        StatusOfPost(kOrigin + "content-TYPE: Application/JSON; charset=utf-8\r\nCONTENT-length: 0\r\n"),
        200);
    EXPECT_EQ(StatusOfGet(kRoot, "Host: localhost:8123\r\nOrigin: http://localhost:8123\r\n"), 200);
    EXPECT_EQ(StatusOfGet(kRoot, kHost + "Sec-Fetch-Site: none\r\n"), 200);
}

TEST(RequestCheckTest, OnlyTheWholeSecretOpens) {
    for (const std::string& path :
         {std::string("/"), std::string("*"), kRoot.substr(0, kRoot.size() - 1), kRoot.substr(1), "/" + kRoot,
          "/1" + kRoot.substr(2), "/0" + kRoot, "http://127.0.0.1:8123" + kRoot})
        EXPECT_EQ(StatusOfGet(path), 404) << path;
    EXPECT_TRUE(AreSameSecret("ab", "ab"));
    for (const char* other : {"", "a", "aa", "bb", "abc", "AB"}) EXPECT_FALSE(AreSameSecret(other, "ab"));
}

TEST(RequestCheckTest, OtherNamesAndSitesAreRefused) {
    for (const char* host : {"127.0.0.1", "127.0.0.1:80", "evil.example:8123", "127.0.0.1:8123.evil.example",
                             "127.0.0.1:08123", "LOCALHOST:8123", "[::1]:8123", ""})
        EXPECT_EQ(StatusOfGet(kRoot, "Host: " + std::string(host) + "\r\n"), 403) << host;
    for (const char* header : {"Origin: http://localhost:8123", "Origin: null", "Origin: http://evil.example",
                               "Origin:", "Origin: http://127.0.0.1:8123/", "Sec-Fetch-Site: cross-site",
                               "Sec-Fetch-Site: same-site"})
        EXPECT_EQ(StatusOfGet(kRoot, kHost + header + "\r\n"), 403) << header;
    EXPECT_EQ(StatusOfGet(kRoot, ""), 403);
    EXPECT_EQ(StatusOfPost(kJson + "Content-Length: 2\r\n"), 403);
}

TEST(RequestCheckTest, WhatAFormOrAnotherEncodingSendsIsRefused) {
    const std::string sized = kOrigin + "Content-Length: 2\r\n";
    for (const char* type : {"", "Content-Type: text/plain\r\n", "Content-Type: application/json5\r\n"})
        EXPECT_EQ(StatusOfPost(sized + type), 415) << type;
    EXPECT_EQ(StatusOfPost(sized + kJson + "Content-Encoding: gzip\r\n"), 415);
    EXPECT_EQ(StatusOfPost(sized + kJson + "Transfer-Encoding: chunked\r\n"), 400);
    EXPECT_EQ(StatusOfPost(sized + kJson + "Expect: 100-continue\r\n"), 417);
    for (const std::string& twice : {kHost, kOrigin, kJson, std::string("Content-Length: 2\r\n")})
        EXPECT_EQ(StatusOfPost(sized + kJson + twice), 400) << twice;
}

TEST(RequestCheckTest, LengthsAreNumbersWithinBounds) {
    EXPECT_EQ(StatusOfPost(kOrigin + kJson), 411);
    for (const char* length : {"65537", "18446744073709551616", "99999999999999999999999999"})
        EXPECT_EQ(StatusOfPost(kOrigin + kJson + "Content-Length: " + length + "\r\n"), 413) << length;
    for (const char* length : {"", "-1", "+1", "1, 1", "0x1", "1 1", "one"})
        EXPECT_EQ(StatusOfPost(kOrigin + kJson + "Content-Length: " + length + "\r\n"), 400) << length;
    EXPECT_EQ(StatusOfGet(kRoot, kHost + "Content-Length: 1\r\n"), 400);
    EXPECT_EQ(StatusOfGet(kRoot + "api/x?" + std::string(kMostTarget, 'y')), 414);
    for (const char* method : {"PUT", "DELETE", "OPTIONS", "CONNECT", "get"})
        EXPECT_EQ(StatusOf(method + (" " + kRoot) + " HTTP/1.1\r\n" + kHost + "\r\n"), 405) << method;
}

TEST(RequestCheckTest, PathsHaveNoTricks) {
    for (const char* path : {"..", "../x", "x/..", "x/./y", "x//y", "/x", "x/", "%2e%2e", "x%2fy", "x%00",
                             "x\\y", "x;y", "a:b", "~", "x#y"})
        EXPECT_EQ(StatusOfGet(kRoot + path), 400) << path;
    for (const char* query : {"?a=%", "?a=%4", "?a=%zz", "?a=% 1", "?a=%-1", "?a=1&a=1", "?a&a", "?&&"})
        EXPECT_NE(StatusOfGet(kRoot + query), 200) << query;
    for (const char* path : {"a.js", "api/session", "...", "a..b", "-_"})
        EXPECT_EQ(StatusOfGet(kRoot + path), 200) << path;
}

TEST(RequestCheckTest, HeadsHaveOneMeaning) {
    const std::string first = "GET " + kRoot + " HTTP/1.1\r\n";
    EXPECT_EQ(StatusOf(first + kHost + "\r\n"), 200);
    std::string many;
    for (int i = 0; i < 64; ++i) many += "X: y\r\n";
    const std::vector<std::string> rests = {"",
                                            kHost,
                                            kHost + "\r\nx",
                                            " " + kHost + "\r\n",
                                            "Host : x\r\n\r\n",
                                            ": x\r\n\r\n",
                                            "x\r\n\r\n",
                                            kHost + many + "\r\n",
                                            "X: a\nb\r\n\r\n",
                                            "X: a\rb\r\n\r\n",
                                            std::string("X: \0\r\n\r\n", 8),
                                            "X: y\r\n folded\r\n\r\n"};
    for (const std::string& rest : rests) EXPECT_EQ(StatusOf(first + rest), 0) << rest;
    const std::vector<std::string> firsts = {"",
                                             "\r\n" + first,
                                             "GET  " + kRoot + " HTTP/1.1\r\n",
                                             "GET " + kRoot + " HTTP/1.1 \r\n",
                                             "GET " + kRoot + " HTTP/2.0\r\n",
                                             "GET " + kRoot + "\r\n",
                                             "GET /\x80 HTTP/1.1\r\n",
                                             " / HTTP/1.1\r\n",
                                             "GET HTTP/1.1\r\n"};
    for (const std::string& line : firsts) EXPECT_EQ(StatusOf(line + kHost + "\r\n"), 0) << line;
}

/// Whether a byte is one of those that may differ: of the path below the token, and of the body's length.
bool MayDiffer(const std::string& post, std::size_t at) {
    const std::size_t path = post.find(kRoot) + kRoot.size(), length = post.find("Length:") + 7;
    return (at >= path && at < post.find(" HTTP/")) || (at >= length && at < post.find("\r\n", length));
}

TEST(RequestCheckTest, ChangeOfAnyByteThatCountsIsRefused) {
    const std::string post = "POST " + kRoot + "api/take HTTP/1.1\r\n" + kHost + kOrigin + kJson +
                             "Sec-Fetch-Site: none\r\nContent-Length: 22\r\n\r\n";
    ASSERT_EQ(StatusOf(post), 200);
    const std::size_t token = post.find(kAddress.token);
    for (std::size_t at = 0; at < post.size(); ++at) {
        EXPECT_EQ(StatusOf(post.substr(0, at)), 0) << at;
        for (int byte = 0; byte < 256 && !MayDiffer(post, at); ++byte) {
            std::string changed = post;
            changed[at] = static_cast<char>(byte);
            if (StatusOf(changed) != 200 || changed == post) continue;
            // The case of what isn't a secret, an older version, another blank, and headers that are no more.
            const bool isCase = std::isalpha(post[at]) && (byte ^ post[at]) == 32 &&
                                (at < token || at >= token + kAddress.token.size());
            const bool isBlank = post[at] == ' ' && byte == '\t';
            const bool isOlder = changed.substr(0, at + 1).ends_with(" HTTP/1.0");
            const std::size_t site = post.find("Sec-Fetch-Site");
            const bool isOther = at >= site && at < site + std::string("Sec-Fetch-Site").size();
            EXPECT_TRUE(isCase || isBlank || isOlder || isOther) << at << " " << byte;
        }
    }
}

TEST(RequestCheckTest, ByteTooManyWhereItCountsIsRefused) {
    const std::string post = "POST " + kRoot + "api/take HTTP/1.1\r\n" + kHost + kOrigin + "\r\n";
    const std::pair<std::size_t, std::size_t> stretches[] = {
        {0, post.find(kRoot) + kRoot.size() - 1},          // the method and the token
        {post.find("127.0.0.1"), post.find("\r\nOrigin")}, // the host
        {post.find("http://"), post.find("\r\n\r\n")}};    // the origin
    for (const auto& [begin, end] : stretches)
        for (std::size_t at = begin + 1; at < end; ++at)
            for (int byte = 0; byte < 256; ++byte) {
                std::string longer = post;
                longer.insert(at, 1, static_cast<char>(byte));
                const int status = StatusOf(longer);
                // All that is missing here is the length of the body.
                ASSERT_TRUE(status != 411 && status != 200) << at << " " << byte;
            }
    EXPECT_EQ(StatusOf(post), 411);
}

} // namespace
