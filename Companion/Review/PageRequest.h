#pragma once

#include <cstddef>
#include <map>
#include <nlohmann/json_fwd.hpp>
#include <string>
#include <string_view>

namespace ovrin {

/// What a page asks for.
struct PageRequest {
    std::string method;                       ///< "GET", "POST"
    std::string path;                         ///< below the page's address: "", "api/tree"
    std::map<std::string, std::string> query; ///< decoded; of any bytes
    std::string body;
};

struct PageAnswer {
    int status = 200; ///< of HTTP
    std::string type = "application/json";
    std::string body;
};

/// A value as JSON. Bytes that are no UTF-8 are replaced.
PageAnswer JsonAnswer(const nlohmann::json& value, int status = 200);
/// {"error": words}.
PageAnswer ErrorAnswer(int status, std::string_view words);

/// The value of a key of the query, or an empty text.
std::string QueryText(const PageRequest& request, const std::string& key);
/// The number of a key of the query, at most `most`; `otherwise` where there is none. Throws Failure for what
/// is no number.
std::size_t QueryNumber(const PageRequest& request, const std::string& key, std::size_t otherwise,
                        std::size_t most);

} // namespace ovrin
