#pragma once

#include <cstddef>
#include <map>
#include <nlohmann/json_fwd.hpp>
#include <string>
#include <string_view>

namespace ovrin {

/// What a page asks for, once it has shown that it may.
struct PageRequest {
    std::string method;                       ///< GET or POST
    std::string path;                         ///< below the secret part of the address: "", "api/take"
    std::map<std::string, std::string> query; ///< decoded, any bytes
    std::string body;                         ///< as it came, at most 64 KB
};

struct PageAnswer {
    int status = 200; ///< of HTTP
    std::string type = "application/json";
    std::string body = {};
    bool isOver = false; ///< nothing is served after this answer
};

/// A value as JSON. Bytes that are no UTF-8 are replaced: names and what other programs said may stand in it.
std::string JsonText(const nlohmann::json& value);
PageAnswer JsonAnswer(const nlohmann::json& value, int status = 200);
/// {"error": words} with that status.
PageAnswer PageError(int status, std::string_view words);

/// The value of a key of the query, or an empty text.
std::string QueryText(const PageRequest& request, const std::string& key);
/// The number of a key of the query, at most `most`; `otherwise` where there is none. Throws Failure for what
/// is no number.
std::size_t QueryNumber(const PageRequest& request, const std::string& key, std::size_t otherwise,
                        std::size_t most);

} // namespace ovrin
