#include "WebGate/RequestHead.h"

#include <algorithm>
#include <cctype>

namespace ovrin {

namespace {

constexpr std::size_t kMostHeaders = 64;
constexpr std::string_view kLineEnd = "\r\n";

bool IsTokenCharacter(char c) {
    return std::isalnum(static_cast<unsigned char>(c)) ||
           std::string_view("!#$%&'*+-.^_`|~").find(c) != std::string_view::npos;
}

bool IsToken(std::string_view text) {
    return !text.empty() && std::ranges::all_of(text, IsTokenCharacter);
}

bool IsPrintable(std::string_view text) {
    return std::ranges::all_of(text, [](char c) { return c > ' ' && c < 127; });
}

bool IsFieldValue(std::string_view text) {
    return std::ranges::none_of(text, [](unsigned char c) { return (c < ' ' && c != '\t') || c == 127; });
}

std::string_view Trimmed(std::string_view text) {
    const std::size_t begin = text.find_first_not_of(" \t");
    if (begin == std::string_view::npos) return {};
    return text.substr(begin, text.find_last_not_of(" \t") - begin + 1);
}

std::string InLowerCase(std::string_view text) {
    std::string lower(text);
    for (char& c : lower) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    return lower;
}

bool ReadFirstLine(std::string_view line, RequestHead& head) {
    const std::size_t first = line.find(' '), last = line.rfind(' ');
    if (first == std::string_view::npos || first == last) return false;
    const std::string_view version = line.substr(last + 1);
    head.method = line.substr(0, first);
    head.target = line.substr(first + 1, last - first - 1);
    return IsToken(head.method) && !head.target.empty() && IsPrintable(head.target) &&
           (version == "HTTP/1.1" || version == "HTTP/1.0");
}

bool ReadHeader(std::string_view line, RequestHead& head) {
    const std::size_t colon = line.find(':');
    if (colon == std::string_view::npos || !IsToken(line.substr(0, colon))) return false;
    const std::string_view value = Trimmed(line.substr(colon + 1));
    head.headers.emplace_back(InLowerCase(line.substr(0, colon)), value);
    return IsFieldValue(value) && head.headers.size() <= kMostHeaders;
}

} // namespace

std::size_t RequestHead::Count(std::string_view name) const {
    return static_cast<std::size_t>(
        std::ranges::count_if(headers, [&](const auto& header) { return header.first == name; }));
}

std::optional<std::string> RequestHead::Value(std::string_view name) const {
    for (const auto& [present, value] : headers)
        if (present == name) return value;
    return {};
}

std::optional<RequestHead> ParseRequestHead(std::string_view text) {
    RequestHead head;
    for (bool isFirst = true;; isFirst = false) {
        const std::size_t end = text.find(kLineEnd);
        if (end == std::string_view::npos) return {};
        const std::string_view line = text.substr(0, end);
        text.remove_prefix(end + kLineEnd.size());
        if (!isFirst && line.empty()) break;
        if (!(isFirst ? ReadFirstLine(line, head) : ReadHeader(line, head))) return {};
    }
    if (!text.empty()) return {};
    return head;
}

} // namespace ovrin
