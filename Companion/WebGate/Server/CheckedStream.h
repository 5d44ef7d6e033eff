#pragma once

#include <chrono>
#include <cstddef>
#include <httplib.h>
#include <string>

namespace ovrin {

/// What the server library reads of a request: only what was checked, as we write it. What a browser sent
/// besides, such as ranges, encodings and forms, it never sees. The answer goes to the connection.
class CheckedStream : public httplib::Stream {
public:
    CheckedStream(int socket, std::string request);

    bool is_readable() const override { return m_Read < m_Request.size(); }
    /// False once the other side has closed.
    bool is_writable() const override;
    ssize_t read(char* bytes, std::size_t count) override;
    ssize_t write(const char* bytes, std::size_t count) override;
    void get_remote_ip_and_port(std::string& ip, int& port) const override;
    void get_local_ip_and_port(std::string& ip, int& port) const override;
    socket_t socket() const override { return m_Socket; }

private:
    const int m_Socket;
    const std::string m_Request;
    std::size_t m_Read = 0;
};

} // namespace ovrin
