#include "WebGate/WebFrame.h"

#include "Descriptor.h"

#include <cstdint>
#include <cstring>
#include <string_view>
#include <sys/socket.h>

namespace ovrin {

namespace {

using Length = std::uint32_t; // both programs run on one machine

void AppendLength(std::string& bytes, std::size_t length) {
    const auto written = static_cast<Length>(length);
    bytes.append(reinterpret_cast<const char*>(&written), sizeof(written));
}

Length LengthAt(const char* bytes) {
    Length length = 0;
    std::memcpy(&length, bytes, sizeof(length));
    return length;
}

bool ReceiveAll(int socket, char* bytes, std::size_t count) {
    while (count > 0) {
        const ssize_t got = Uninterrupted([&] { return recv(socket, bytes, count, MSG_WAITALL); });
        if (got <= 0) return false;
        bytes += got;
        count -= static_cast<std::size_t>(got);
    }
    return true;
}

} // namespace

bool SendFrame(int socket, const WebFrame& frame) {
    std::string texts;
    for (const std::string& text : frame) {
        AppendLength(texts, text.size());
        texts += text;
    }
    std::string all;
    AppendLength(all, texts.size());
    all += texts;
    std::string_view left = all;
    while (!left.empty()) {
        const ssize_t sent =
            Uninterrupted([&] { return send(socket, left.data(), left.size(), MSG_NOSIGNAL); });
        if (sent <= 0) return false;
        left.remove_prefix(static_cast<std::size_t>(sent));
    }
    return true;
}

std::optional<WebFrame> ReceiveFrame(int socket, std::size_t most) {
    char head[sizeof(Length)];
    if (!ReceiveAll(socket, head, sizeof(head)) || LengthAt(head) > most) return {};
    std::string bytes(LengthAt(head), '\0');
    if (!ReceiveAll(socket, bytes.data(), bytes.size())) return {};
    WebFrame frame;
    for (std::size_t at = 0; at < bytes.size();) {
        if (bytes.size() - at < sizeof(Length)) return {};
        const std::size_t length = LengthAt(bytes.data() + at);
        at += sizeof(Length);
        if (bytes.size() - at < length) return {};
        frame.push_back(bytes.substr(at, length));
        at += length;
    }
    return frame;
}

} // namespace ovrin
