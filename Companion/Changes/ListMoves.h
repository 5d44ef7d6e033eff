#pragma once

#include <cstddef>
#include <vector>

namespace ovrin {

/// Which elements of a list moved, when each has a new index in `targets`, or -1 if it is gone: as few as can
/// be taken out so that the others keep their order. Ascending.
std::vector<std::size_t> FindMoved(const std::vector<int>& targets);

} // namespace ovrin
