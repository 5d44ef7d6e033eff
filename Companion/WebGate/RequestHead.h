#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace ovrin {

/// The first lines of a request, up to the empty one.
struct RequestHead {
    std::string method, target;
    std::vector<std::pair<std::string, std::string>> headers; ///< names in lower case

    /// How often a header is there. `name` is in lower case.
    std::size_t Count(std::string_view name) const;
    /// The value of the first such header; nothing if there is none.
    std::optional<std::string> Value(std::string_view name) const;
};

/// Reads a head, with the empty line at its end. It is stricter than HTTP asks for, since what two readers
/// understand in two ways is how attacks pass checks: lines end in CRLF, between the three words of the first
/// there is one space, no control characters, no continued lines, no space ahead of a colon, at most 64
/// headers. Nothing for anything else.
std::optional<RequestHead> ParseRequestHead(std::string_view text);

} // namespace ovrin
