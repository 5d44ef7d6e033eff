#pragma once

#include <chrono>
#include <cstddef>
#include <optional>
#include <string>

namespace ovrin {

/// Reads one request from a connection, by a clock that runs from the beginning: who sends it byte by byte
/// has no more time than others.
class RequestReader {
public:
    /// `socket` stays open.
    explicit RequestReader(int socket);

    /// The head with its empty line, however lines end; nothing if it isn't there in time, or is longer than
    /// 16 KB.
    std::optional<std::string> Head();
    /// The body of so many bytes; nothing if it isn't there in time.
    std::optional<std::string> Body(std::size_t length);

private:
    bool ReadMore();

    const int m_Socket;
    const std::chrono::steady_clock::time_point m_End;
    std::string m_Read; // and not taken yet
};

/// Writes within a time that ends `end`. False if that can't be done.
bool SendInTime(int socket, const char* bytes, std::size_t count, std::chrono::steady_clock::time_point end);

/// Closes the sending half, and waits a moment for the other side to have read: a connection that is closed
/// with something unread takes the answer with it.
void FinishSending(int socket);

} // namespace ovrin
