#include "WebGate/SocketTable.h"

#include <algorithm>
#include <cstdio>
#include <sstream>
#include <string>

namespace ovrin {

namespace {

/// How an address ends there, of IPv4 as of one that stands for it in IPv6.
std::string EndOfAddress(int port) {
    char text[32];
    std::snprintf(text, sizeof(text), "0100007F:%04X", static_cast<unsigned>(port));
    return text;
}

} // namespace

std::optional<SocketOwner> FindOwner(std::string_view table, int from, int to) {
    const std::string local = EndOfAddress(from), remote = EndOfAddress(to);
    while (!table.empty()) {
        const std::string_view line = table.substr(0, table.find('\n'));
        table.remove_prefix(std::min(table.size(), line.size() + 1));
        if (line.find(local) == std::string_view::npos) continue;
        std::istringstream words{std::string(line)};
        std::string number, here, there, state, queues, timer, retries;
        SocketOwner owner{};
        unsigned long long timeout = 0, inode = 0;
        words >> number >> here >> there >> state >> queues >> timer >> retries >> owner.user >> timeout >>
            inode;
        owner.isOpen = inode != 0;
        if (words && here.ends_with(local) && there.ends_with(remote)) return owner;
    }
    return {};
}

} // namespace ovrin
