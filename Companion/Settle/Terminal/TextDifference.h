#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace ovrin {

/// Bytes of a text, from `begin` to ahead of `end`.
struct TextRange {
    std::size_t begin, end;
    bool operator==(const TextRange&) const = default;
};

/// The parts of `text` that `other` doesn't have, word by word, in order. Where the two have little in common
/// it is all between what they begin and end with alike, so that the time stays linear.
std::vector<TextRange> PartsNotIn(std::string_view text, std::string_view other);

} // namespace ovrin
