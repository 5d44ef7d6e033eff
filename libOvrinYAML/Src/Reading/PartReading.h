#pragma once

#include "Values/TaskRunner.h"

#include <cstddef>
#include <functional>
#include <optional>
#include <string>
#include <vector>

namespace ovrin_yaml {

/// Gives up to `size` bytes of a file from `offset` on, and tells how many; fewer only at the end. May throw.
/// May be called on several threads at once.
using PartSource = std::function<std::size_t(std::size_t offset, char* bytes, std::size_t size)>;

/// The bytes of an object file, how many of them stand in front of the first NUL, and where in these the
/// documents begin behind the first.
struct CutText {
    std::string bytes;
    std::size_t length = 0;
    std::vector<std::size_t> starts; // ascending
};

/// A part that makes calls cheap and stays in the cache while it is cut.
inline constexpr std::size_t kUsualPart = std::size_t{1} << 20;

/// Reads a file that had `size` bytes a moment ago in parts, and cuts each while it is at hand. Nothing if it
/// has another size by now. Throws what `source` throws.
std::optional<CutText> ReadInParts(const PartSource& source, std::size_t size, const TaskRunner& run,
                                   std::size_t partSize = kUsualPart);

} // namespace ovrin_yaml
