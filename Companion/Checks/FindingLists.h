#pragma once

#include "Checks/Finding.h"

#include <cstddef>
#include <string>
#include <vector>

namespace ovrin {

/// What a run of checks came to.
struct CheckedScenes {
    std::vector<CheckedScene> scenes; ///< those with findings or a failure
    std::size_t checked = 0;          ///< all scenes that could be checked
    std::size_t others = 0;           ///< files that are no scenes and need not be
    std::size_t accepted = 0;         ///< findings that a baseline accepts
};

/// A line for each finding, as compilers write them:
///
///     Scenes/Pier.ovrin:120: error: Pier/Lantern (12): m_Father is none [father-lacks-child]
std::string ToLines(const CheckedScenes& result);

/// An object with the list "findings", for scripts and as a baseline.
std::string ToJson(const CheckedScenes& result);

/// A log of SARIF 2.1.0, which code hosts show beside the lines.
std::string ToSarif(const CheckedScenes& result);

/// A text for JSON: itself, or if it isn't UTF-8 with its strange bytes as escapes.
std::string AsUtf8(const std::string& text);

} // namespace ovrin
