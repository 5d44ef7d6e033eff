#pragma once

#include <string>
#include <string_view>

/// What a fuzz target defines: the check of one input. Returns what was found to be wrong, or an empty text.
std::string CheckInput(std::string_view input);
