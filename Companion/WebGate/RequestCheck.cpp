#include "WebGate/RequestCheck.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <charconv>
#include <optional>

namespace ovrin {

namespace {

/// Ends the checks of a request.
struct Refuse {
    RefusedRequest why;
};

void Want(bool isSo, int status, const char* words) {
    if (!isSo) throw Refuse{{status, words}};
}

/// What a check goes by can be there once at most: of two the browser, or somebody on the way, may have meant
/// the other.
void CheckHeadersAreClear(const RequestHead& head) {
    constexpr std::array<std::string_view, 5> kOnce = {"host", "origin", "content-type", "content-length",
                                                       "sec-fetch-site"};
    Want(std::ranges::all_of(kOnce, [&](std::string_view name) { return head.Count(name) <= 1; }), 400,
         "A header that may stand once is there twice");
    Want(head.Count("transfer-encoding") == 0, 400, "The body has to come in one piece, with its length");
    Want(head.Count("content-encoding") == 0, 415, "The body has to come as it is, not compressed");
    Want(head.Count("expect") == 0, 417, "Send the body without asking first");
}

/// Another name that leads to this machine is how a foreign page would come to read ours.
void CheckHost(const std::string& host, int port) {
    const std::string ending = ":" + std::to_string(port);
    Want(host == "127.0.0.1" + ending || host == "localhost" + ending, 403,
         "The page has another address: open the one that ovrin told");
}

void CheckSite(const RequestHead& head, const std::string& host) {
    const std::optional<std::string> origin = head.Value("origin"), site = head.Value("sec-fetch-site");
    Want(!origin || *origin == "http://" + host, 403, "Pages of other sites may ask for nothing here");
    Want(!site || *site == "same-origin" || *site == "none", 403,
         "A link of another page leads nowhere here: put the address that ovrin told into the browser's "
         "address line");
    Want(head.method != "POST" || origin, 403, "A request that changes something has to tell its origin");
}

bool IsOfPath(char c) {
    return std::isalnum(static_cast<unsigned char>(c)) ||
           std::string_view("._-/").find(c) != std::string_view::npos;
}

void CheckPath(const std::string& path) {
    const std::string framed = "/" + path + "/";
    const auto holds = [&](const char* part) { return framed.find(part) != std::string::npos; };
    Want(path.empty() ||
             (std::ranges::all_of(path, IsOfPath) && !holds("//") && !holds("/./") && !holds("/../")),
         400, "There is no such path");
}

std::optional<unsigned char> HexByte(std::string_view digits) {
    unsigned char byte = 0;
    const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), byte, 16);
    if (digits.size() != 2 || error != std::errc() || end != digits.data() + digits.size()) return {};
    return byte;
}

std::string Decoded(std::string_view text) {
    std::string decoded;
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] != '%') {
            decoded += text[i] == '+' ? ' ' : text[i];
            continue;
        }
        const std::optional<unsigned char> byte = HexByte(text.substr(i + 1, 2));
        Want(byte.has_value(), 400, "The query isn't well encoded");
        decoded += static_cast<char>(*byte);
        i += 2;
    }
    return decoded;
}

std::vector<std::pair<std::string, std::string>> ReadQuery(std::string_view text) {
    std::vector<std::pair<std::string, std::string>> query;
    while (!text.empty()) {
        const std::string_view part = text.substr(0, text.find('&'));
        text.remove_prefix(std::min(text.size(), part.size() + 1));
        const std::size_t equals = std::min(part.find('='), part.size());
        std::string name = Decoded(part.substr(0, equals));
        Want(std::ranges::find(query, name, &std::pair<std::string, std::string>::first) == query.end(), 400,
             "The query tells something twice");
        query.emplace_back(std::move(name), Decoded(part.substr(std::min(equals + 1, part.size()))));
    }
    return query;
}

PassedRequest ReadTarget(const RequestHead& head, const std::string& token) {
    const std::string_view target = head.target;
    Want(target.size() <= kMostTarget, 414, "The address is too long");
    const std::size_t tokenEnd = std::min(target.find('/', 1), target.size());
    Want(target.starts_with('/') && AreSameSecret(target.substr(1, tokenEnd - 1), token) &&
             tokenEnd < target.size(),
         404, "Nothing is here: open the whole address that ovrin told, with the slash at its end");
    const std::string_view rest = target.substr(tokenEnd + 1);
    const std::size_t question = std::min(rest.find('?'), rest.size());
    PassedRequest passed{head.method, std::string(rest.substr(0, question)), {}, 0};
    CheckPath(passed.path);
    passed.query = ReadQuery(rest.substr(std::min(question + 1, rest.size())));
    return passed;
}

bool IsJson(std::string type) {
    type = type.substr(0, type.find_first_of("; \t"));
    for (char& c : type) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return type == "application/json";
}

std::size_t ReadBodyLength(const RequestHead& head) {
    const std::string given = head.Value("content-length").value_or("0");
    std::size_t length = 0;
    const auto [end, error] = std::from_chars(given.data(), given.data() + given.size(), length);
    Want(end == given.data() + given.size() && error != std::errc::invalid_argument, 400,
         "The length of the body is no number");
    Want(error == std::errc() && length <= kMostBody, 413, "The body is too long");
    return length;
}

PassedRequest Check(const RequestHead& head, const PageAddress& address) {
    CheckHeadersAreClear(head);
    Want(head.method == "GET" || head.method == "HEAD" || head.method == "POST", 405,
         "Only GET, HEAD and POST are known here");
    const std::string host = head.Value("host").value_or("");
    CheckHost(host, address.port);
    CheckSite(head, host);
    PassedRequest passed = ReadTarget(head, address.token);
    passed.bodyLength = ReadBodyLength(head);
    if (head.method == "POST") {
        Want(head.Count("content-length") == 1, 411, "The body has to come with its length");
        Want(IsJson(head.Value("content-type").value_or("")), 415, "The body has to be application/json");
    } else {
        Want(passed.bodyLength == 0, 400, "Only POST has a body");
    }
    return passed;
}

} // namespace

std::variant<PassedRequest, RefusedRequest> CheckRequest(const RequestHead& head,
                                                         const PageAddress& address) {
    try {
        return Check(head, address);
    } catch (const Refuse& refuse) {
        return refuse.why;
    }
}

bool AreSameSecret(std::string_view given, std::string_view secret) {
    // The length is no secret.
    if (given.size() != secret.size()) return false;
    volatile unsigned char difference = 0;
    for (std::size_t i = 0; i < secret.size(); ++i)
        difference = static_cast<unsigned char>(difference | (given[i] ^ secret[i]));
    return difference == 0;
}

} // namespace ovrin
