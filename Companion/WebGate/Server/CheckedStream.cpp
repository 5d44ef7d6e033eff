#include "WebGate/Server/CheckedStream.h"

#include "Descriptor.h"
#include "WebGate/Server/RequestReader.h"

#include <algorithm>
#include <poll.h>
#include <utility>

namespace ovrin {

namespace {

/// For each piece that is written: a connection that takes nothing for so long is given up.
constexpr std::chrono::seconds kTimeForPiece{30};

} // namespace

CheckedStream::CheckedStream(int socket, std::string request)
    : m_Socket(socket), m_Request(std::move(request)) {}

bool CheckedStream::is_writable() const {
    pollfd state{m_Socket, POLLRDHUP, 0};
    return Uninterrupted([&] { return poll(&state, 1, 0); }) == 0;
}

ssize_t CheckedStream::read(char* bytes, std::size_t count) {
    const std::size_t copied = m_Request.copy(bytes, count, m_Read);
    m_Read += copied;
    return static_cast<ssize_t>(copied);
}

ssize_t CheckedStream::write(const char* bytes, std::size_t count) {
    const auto end = std::chrono::steady_clock::now() + kTimeForPiece;
    return SendInTime(m_Socket, bytes, count, end) ? static_cast<ssize_t>(count) : -1;
}

void CheckedStream::get_remote_ip_and_port(std::string& ip, int& port) const {
    ip.clear();
    port = 0;
}

void CheckedStream::get_local_ip_and_port(std::string& ip, int& port) const {
    ip.clear();
    port = 0;
}

} // namespace ovrin
