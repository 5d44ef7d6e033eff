#pragma once

#include <string_view>

namespace ovrin {

/// Writes a result to standard output, to its last byte. Throws Failure where that can't be done; a reader
/// that has seen enough, such as a pager that was left, is no failure.
void PrintResult(std::string_view text);

/// Says something to the user, on standard error and in one piece, as far as that takes it. Signals don't
/// disturb it.
void Tell(std::string_view text);

} // namespace ovrin
