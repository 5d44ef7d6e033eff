#include "Reading/DocumentCut.h"

#include "Writing/WrittenForm.h"

#include <algorithm>
#include <cstring>

namespace ovrin_yaml {

bool HasSignature(std::string_view bytes) {
    return bytes.substr(0, kFileSignature.size() + 4).find(kFileSignature) != std::string_view::npos;
}

std::string_view FileHeaderOf(std::string_view text) {
    return text.substr(0, text.find(kDocumentMark));
}

bool HasWrittenHeader(std::string_view text) {
    const std::string_view header = FileHeaderOf(text);
    if (!header.starts_with(kFileHeaderStart) || !header.ends_with('\n')) return false;
    const std::string_view prefix =
        header.substr(kFileHeaderStart.size(), header.size() - kFileHeaderStart.size() - 1);
    const auto isPlain = [](char c) {
        return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') ||
               std::string_view(".,:-").find(c) != std::string_view::npos;
    };
    return std::all_of(prefix.begin(), prefix.end(), isPlain) &&
           text.substr(header.size()).starts_with(kDocumentStart);
}

/// Looks for the first "!" of "\n--- !o!": a sign that stands in headers and seldom elsewhere is found many
/// times faster than one that stands in every line.
const char* FindDocumentEnd(const char* begin, const char* end) {
    constexpr std::size_t kSignAt = kNextHeader.find('!');
    const char* position = begin + kDocumentStart.size();
    while (position < end) {
        const auto* sign =
            static_cast<const char*>(std::memchr(position, '!', static_cast<std::size_t>(end - position)));
        if (!sign) break;
        const char* header = sign - kSignAt;
        if (std::string_view(header, static_cast<std::size_t>(end - header)).starts_with(kNextHeader))
            return header + 1;
        position = sign + 1;
    }
    return end;
}

} // namespace ovrin_yaml
