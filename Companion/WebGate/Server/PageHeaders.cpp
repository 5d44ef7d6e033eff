#include "WebGate/Server/PageHeaders.h"

namespace ovrin {

httplib::Headers PageHeaders() {
    return {{"Content-Security-Policy",
             "default-src 'none'; script-src 'self'; style-src 'self'; connect-src 'self'; img-src 'self'; "
             "base-uri 'none'; form-action 'none'; frame-ancestors 'none'"},
            {"X-Content-Type-Options", "nosniff"},
            {"Referrer-Policy", "no-referrer"},
            {"Cache-Control", "no-store"},
            {"Cross-Origin-Resource-Policy", "same-origin"},
            {"Cross-Origin-Opener-Policy", "same-origin"}};
}

std::string ErrorBody(const std::string& words) {
    return "{\"error\": \"" + words + "\"}";
}

std::string RefusalText(const RefusedRequest& refused) {
    const std::string body = ErrorBody(refused.words);
    std::string text = "HTTP/1.1 " + std::to_string(refused.status) + " Refused\r\n";
    for (const auto& [name, value] : PageHeaders())
        text.append(name).append(": ").append(value).append("\r\n");
    return text + "Connection: close\r\nContent-Type: " + kErrorType +
           "\r\nContent-Length: " + std::to_string(body.size()) + "\r\n\r\n" + body;
}

} // namespace ovrin
