#pragma once

#include "Settle/SettleScenes.h"

#include <string>
#include <vector>

namespace ovrin {

/// How a person left the terminal's faces.
struct TerminalEnd {
    std::vector<std::string> finished; ///< paths of the scenes that are in place
    Remarks refused;                   ///< about those that are settled and are not
};

} // namespace ovrin
