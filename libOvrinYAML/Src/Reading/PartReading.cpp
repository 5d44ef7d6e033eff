#include "Reading/PartReading.h"

#include "Reading/DocumentCut.h"
#include "Values/Arena.h"
#include "Writing/WrittenForm.h"

#include <algorithm>
#include <cstring>
#include <exception>
#include <string_view>

namespace ovrin_yaml {

namespace {

/// One part of a text on its way into memory.
struct Part {
    std::size_t length = 0;          // that was read
    std::size_t end = SIZE_MAX;      // where a NUL ends the text
    std::vector<std::size_t> starts; // of documents whose header stands in the part as a whole
};

Part ReadPart(const PartSource& source, char* text, std::size_t offset, std::size_t size) {
    Part part;
    char* const begin = text + offset;
    while (part.length < size) {
        const std::size_t count = source(offset + part.length, begin + part.length, size - part.length);
        if (count == 0) break;
        part.length += count;
    }
    const char* const end = begin + part.length;
    if (const void* nul = std::memchr(begin, '\0', part.length))
        part.end = static_cast<std::size_t>(static_cast<const char*>(nul) - text);
    for (const char* start = FindDocumentEnd(begin, end); start != end; start = FindDocumentEnd(start, end))
        part.starts.push_back(static_cast<std::size_t>(start - text));
    return part;
}

/// Adds the starts of documents whose header stands on both sides of `seam`, or so close behind it that a
/// search from there on misses it.
void AddAtSeam(std::string_view text, std::size_t seam, std::vector<std::size_t>& starts) {
    const std::size_t behind = std::min(seam + kDocumentStart.size(), text.size());
    for (std::size_t at = seam - std::min(seam, kNextHeader.size()); at < behind; ++at) {
        if (!text.substr(at).starts_with(kNextHeader)) continue;
        const std::size_t start = at + 1;
        const auto place = std::lower_bound(starts.begin(), starts.end(), start);
        if (place == starts.end() || *place != start) starts.insert(place, start);
    }
}

} // namespace

std::optional<CutText> ReadInParts(const PartSource& source, std::size_t size, const TaskRunner& run,
                                   std::size_t partSize) {
    std::vector<Part> parts((size + partSize - 1) / partSize);
    std::exception_ptr failure; // nothing may leave the string's operation
    CutText text;
    text.bytes.resize_and_overwrite(size, [&](char* bytes, std::size_t) {
        AdviseHugePages(bytes, size);
        try {
            run(parts.size(), [&](std::size_t i) {
                const std::size_t offset = i * partSize;
                parts[i] = ReadPart(source, bytes, offset, std::min(partSize, size - offset));
            });
        } catch (...) {
            failure = std::current_exception();
        }
        const auto isWhole = [&](const Part& part) {
            const auto i = static_cast<std::size_t>(&part - parts.data());
            return part.length == std::min(partSize, size - i * partSize);
        };
        return !failure && std::all_of(parts.begin(), parts.end(), isWhole) ? size : 0;
    });
    if (failure) std::rethrow_exception(failure);
    char next;
    if (text.bytes.size() != size || source(size, &next, 1) != 0) return std::nullopt;

    text.length = size;
    for (std::size_t i = 0; i < parts.size(); ++i) {
        text.starts.insert(text.starts.end(), parts[i].starts.begin(), parts[i].starts.end());
        text.length = std::min(text.length, parts[i].end);
        // As long as no starts but the part's stand behind them.
        if (i > 0) AddAtSeam(text.bytes, i * partSize, text.starts);
    }
    const auto isCutOff = [&](std::size_t start) { return start + kDocumentStart.size() > text.length; };
    while (!text.starts.empty() && isCutOff(text.starts.back())) text.starts.pop_back();
    return text;
}

} // namespace ovrin_yaml
