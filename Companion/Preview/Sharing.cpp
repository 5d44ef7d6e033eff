#include "Preview/Sharing.h"

#include "Words/Failure.h"

#include <algorithm>
#include <charconv>
#include <numeric>
#include <queue>
#include <string_view>
#include <utility>

namespace ovrin {

namespace {

constexpr std::size_t kMostParts = 10'000;

/// 0 for what is no number.
std::size_t Number(std::string_view text) {
    std::size_t number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    return error == std::errc() && end == text.data() + text.size() ? number : 0;
}

} // namespace

bool Part::IsSound() const {
    return number >= 1 && number <= parts && parts <= kMostParts;
}

Part ParsePart(const std::string& text) {
    const std::size_t slash = std::min(text.find('/'), text.size());
    const Part part = {Number(std::string_view(text).substr(0, slash)),
                       slash < text.size() ? Number(std::string_view(text).substr(slash + 1)) : 0};
    if (!part.IsSound())
        throw Failure("\"" + text + "\" is no part: \"2/4\" is part 2 of 4, and there may be " +
                      std::to_string(kMostParts));
    return part;
}

std::vector<std::size_t> ShareOut(std::span<const std::uint64_t> costs, std::size_t parts) {
    std::vector<std::size_t> dearest(costs.size());
    std::iota(dearest.begin(), dearest.end(), std::size_t{0});
    std::ranges::stable_sort(dearest, std::ranges::greater(),
                             [&](std::size_t piece) { return costs[piece]; });
    using Load = std::pair<std::uint64_t, std::size_t>; // of a part: the least is the top
    std::priority_queue<Load, std::vector<Load>, std::greater<>> loads;
    for (std::size_t part = 0; part < parts; ++part) loads.emplace(0, part);
    std::vector<std::size_t> partOf(costs.size());
    for (const std::size_t piece : dearest) {
        const auto [load, part] = loads.top();
        loads.pop();
        loads.emplace(load + costs[piece], part);
        partOf[piece] = part;
    }
    return partOf;
}

} // namespace ovrin
