#pragma once

#include "Preview/Answer.h"

#include <string>

namespace ovrin {

/// The answer as a comment on a pull request. Nothing of names and values is taken for markup. It has at most
/// kMostMarkdown bytes, and tells what didn't find room.
std::string ToMarkdown(const PreviewAnswer& answer);

/// Below the 65,536 characters that a comment may have.
inline constexpr std::size_t kMostMarkdown = 60'000;

} // namespace ovrin
