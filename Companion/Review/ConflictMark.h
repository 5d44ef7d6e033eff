#pragma once

#include "Conflicts/SceneMerge.h"

#include <cstddef>
#include <optional>

namespace ovrin {

/// How far a conflict of a scene is, for a page.
struct ConflictMark {
    const OpenConflict* about; ///< must outlive the mark
    std::size_t item;          ///< its index among the conflicts of all scenes
    bool isOpen = true;
    std::optional<Side> decided = {}, proposed = {};
};

} // namespace ovrin
