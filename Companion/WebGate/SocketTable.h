#pragma once

#include <optional>
#include <string_view>
#include <sys/types.h>

namespace ovrin {

/// One end of a connection within this machine.
struct SocketOwner {
    uid_t user;
    bool isOpen; ///< some process has it; the system tells nobody's user for one that was closed
};

/// Finds the end of a connection on 127.0.0.1 that has the port `from` and leads to the port `to`, in what
/// Linux has in /proc/net/tcp and tcp6. Nothing if it isn't there.
std::optional<SocketOwner> FindOwner(std::string_view table, int from, int to);

} // namespace ovrin
