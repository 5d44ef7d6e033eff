#include "WebGate/Server/PeerCheck.h"

#include "Descriptor.h"
#include "WebGate/SocketTable.h"

#include <arpa/inet.h>
#include <fstream>
#include <iterator>
#include <netinet/in.h>
#include <string>
#include <sys/socket.h>
#include <unistd.h>

namespace ovrin {

namespace {

using NameOf = int (*)(int, sockaddr*, socklen_t*);

/// The port of one end of a connection.
int PortOf(int socket, NameOf nameOf) {
    sockaddr_in address{};
    socklen_t size = sizeof(address);
    return nameOf(socket, reinterpret_cast<sockaddr*>(&address), &size) == 0 ? ntohs(address.sin_port) : 0;
}

std::optional<SocketOwner> Find(int from, int to) {
    for (const char* name : {"/proc/net/tcp", "/proc/net/tcp6"}) {
        std::ifstream file(name);
        const std::string table{std::istreambuf_iterator<char>(file), {}};
        if (const std::optional<SocketOwner> found = FindOwner(table, from, to)) return found;
    }
    return {};
}

} // namespace

PeerCheck::PeerCheck(int port) {
    const Descriptor own(socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0));
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_port = htons(static_cast<in_port_t>(port));
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    if (getuid() == 0 || connect(own.Get(), reinterpret_cast<sockaddr*>(&address), sizeof(address)) != 0)
        return;
    const std::optional<SocketOwner> owner = Find(PortOf(own.Get(), getsockname), port);
    m_Works = owner && owner->isOpen && owner->user == getuid();
}

bool PeerCheck::IsOurs(int socket) const {
    if (!m_Works) return true;
    const std::optional<SocketOwner> owner = Find(PortOf(socket, getpeername), PortOf(socket, getsockname));
    return owner && owner->isOpen && (owner->user == getuid() || owner->user == 0);
}

} // namespace ovrin
