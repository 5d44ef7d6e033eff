#include "Changes/ListMoves.h"

#include <algorithm>

namespace ovrin {

/// Those that stay are a longest ascending run of the targets: `ends` has, for each length, the element at
/// which a run of that length ends with the least target.
std::vector<std::size_t> FindMoved(const std::vector<int>& targets) {
    constexpr std::size_t kNone = static_cast<std::size_t>(-1);
    std::vector<std::size_t> ends, before(targets.size(), kNone), moved;
    for (std::size_t i = 0; i < targets.size(); ++i) {
        if (targets[i] < 0) continue;
        const auto place =
            std::ranges::lower_bound(ends, targets[i], {}, [&](std::size_t end) { return targets[end]; });
        if (place != ends.begin()) before[i] = *(place - 1);
        if (place == ends.end())
            ends.push_back(i);
        else
            *place = i;
    }
    std::vector<bool> stays(targets.size(), false);
    for (std::size_t i = ends.empty() ? kNone : ends.back(); i != kNone; i = before[i]) stays[i] = true;
    for (std::size_t i = 0; i < targets.size(); ++i)
        if (targets[i] >= 0 && !stays[i]) moved.push_back(i);
    return moved;
}

} // namespace ovrin
