#include "Review/PageRequest.h"

#include "Words/Failure.h"

#include <algorithm>
#include <charconv>
#include <nlohmann/json.hpp>

namespace ovrin {

using nlohmann::json;

std::string JsonText(const json& value) {
    return value.dump(-1, ' ', false, json::error_handler_t::replace);
}

PageAnswer JsonAnswer(const json& value, int status) {
    return {status, "application/json", JsonText(value)};
}

PageAnswer PageError(int status, std::string_view words) {
    return JsonAnswer({{"error", words}}, status);
}

std::string QueryText(const PageRequest& request, const std::string& key) {
    const auto found = request.query.find(key);
    return found == request.query.end() ? "" : found->second;
}

std::size_t QueryNumber(const PageRequest& request, const std::string& key, std::size_t otherwise,
                        std::size_t most) {
    const std::string text = QueryText(request, key);
    if (text.empty()) return otherwise;
    std::size_t number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc() || end != text.data() + text.size())
        throw Failure("\"" + key + "\" is no number");
    return std::min(number, most);
}

} // namespace ovrin
