#pragma once

#include <optional>
#include <string_view>

namespace ovrin {

/// The number that a text is as a whole, if it is a finite one.
std::optional<double> NumberIn(std::string_view text);

} // namespace ovrin
