#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <vector>

namespace ovrin {

/// One of the parts in which several machines answer one question.
struct Part {
    std::size_t number = 1; ///< from 1
    std::size_t parts = 1;

    /// Whether there can be such a part.
    bool IsSound() const;
};

/// Reads "2/4", part 2 of 4. Throws Failure.
Part ParsePart(const std::string& text);

/// The part, from 0, that each piece of work goes to, so that all parts cost about the same: the dearest
/// piece first, each to the part that has the least so far. Whoever asks the same is told the same.
std::vector<std::size_t> ShareOut(std::span<const std::uint64_t> costs, std::size_t parts);

} // namespace ovrin
