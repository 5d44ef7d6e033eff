#include "WebGate/Server/RequestReader.h"

#include "Descriptor.h"

#include <algorithm>
#include <poll.h>
#include <string_view>
#include <sys/socket.h>
#include <utility>

namespace ovrin {

namespace {

using Clock = std::chrono::steady_clock;

constexpr std::chrono::seconds kTimeForRequest{10};
constexpr std::chrono::milliseconds kTimeForEnd{500};
constexpr std::size_t kMostHead = std::size_t{16} * 1024;
constexpr std::string_view kHeadEnd = "\r\n\r\n";

/// False once the time is over.
bool WaitFor(int socket, short event, Clock::time_point end) {
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(end - Clock::now()).count();
    pollfd readiness{socket, event, 0};
    return left > 0 && Uninterrupted([&] { return poll(&readiness, 1, static_cast<int>(left)); }) > 0;
}

} // namespace

RequestReader::RequestReader(int socket) : m_Socket(socket), m_End(Clock::now() + kTimeForRequest) {}

bool RequestReader::ReadMore() {
    char buffer[4096];
    if (!WaitFor(m_Socket, POLLIN, m_End)) return false;
    const ssize_t count = Uninterrupted([&] { return recv(m_Socket, buffer, sizeof(buffer), 0); });
    if (count > 0) m_Read.append(buffer, static_cast<std::size_t>(count));
    return count > 0;
}

std::optional<std::string> RequestReader::Head() {
    std::size_t searched = 0;
    for (;;) {
        const std::size_t end = m_Read.find(kHeadEnd, searched);
        if (end != std::string::npos) {
            if (end + kHeadEnd.size() > kMostHead) return {};
            std::string rest = m_Read.substr(end + kHeadEnd.size());
            m_Read.resize(end + kHeadEnd.size());
            return std::exchange(m_Read, std::move(rest));
        }
        // Lines that end in another way are no request either, and nothing else needs to be waited for.
        if (m_Read.find("\n\n", searched) != std::string::npos) return std::exchange(m_Read, {});
        searched = m_Read.size() < kHeadEnd.size() ? 0 : m_Read.size() - kHeadEnd.size();
        if (m_Read.size() >= kMostHead || !ReadMore()) return {};
    }
}

std::optional<std::string> RequestReader::Body(std::size_t length) {
    while (m_Read.size() < length)
        if (!ReadMore()) return {};
    return m_Read.substr(0, length); // what follows is of a request that this connection doesn't serve
}

bool SendInTime(int socket, const char* bytes, std::size_t count, Clock::time_point end) {
    while (count > 0) {
        if (!WaitFor(socket, POLLOUT, end)) return false;
        const ssize_t sent =
            Uninterrupted([&] { return send(socket, bytes, count, MSG_NOSIGNAL | MSG_DONTWAIT); });
        if (sent < 0 && errno != EAGAIN) return false;
        bytes += std::max<ssize_t>(sent, 0);
        count -= static_cast<std::size_t>(std::max<ssize_t>(sent, 0));
    }
    return true;
}

void FinishSending(int socket) {
    ::shutdown(socket, SHUT_WR);
    char unread[4096];
    const Clock::time_point end = Clock::now() + kTimeForEnd;
    while (WaitFor(socket, POLLIN, end) && recv(socket, unread, sizeof(unread), MSG_DONTWAIT) > 0) {
    }
}

} // namespace ovrin
