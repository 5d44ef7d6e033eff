#pragma once

#include "WebGate/RequestHead.h"

#include <cstddef>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

namespace ovrin {

/// Where a page stands: http://127.0.0.1:PORT/TOKEN/.
struct PageAddress {
    std::string token;
    int port;
};

/// A request that may reach the model.
struct PassedRequest {
    std::string method; ///< GET, HEAD or POST
    std::string path;   ///< below the token: "", "api/take"; letters, digits and ".-_/" alone, no ".."
    std::vector<std::pair<std::string, std::string>> query; ///< decoded; no name twice
    std::size_t bodyLength;                                 ///< bytes that follow the head
};

/// Why a request is refused.
struct RefusedRequest {
    int status;
    std::string words; ///< a sentence for people
};

constexpr std::size_t kMostBody = std::size_t{64} * 1024;
constexpr std::size_t kMostTarget = 4096;

/// Who may ask: what knows the token, and reached this very address by a page of ours or by the user's own
/// hand. Names that lead here from elsewhere (Host), pages of other sites (Origin, Sec-Fetch-Site), forms
/// (Content-Type) and all that a page of ours never sends are refused.
std::variant<PassedRequest, RefusedRequest> CheckRequest(const RequestHead& head, const PageAddress& address);

/// Whether two texts are the same, in a time that tells nothing of where they differ.
bool AreSameSecret(std::string_view given, std::string_view secret);

} // namespace ovrin
