#pragma once

#include <sstream>

/// Writes the whole text of `message` to standard error, one message at a time. The text stays in the buffer:
/// a unit that adds to its buffer and shows it again shows its earlier messages too.
void ErrMsg(std::stringstream& message);
