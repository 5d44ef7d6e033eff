#pragma once

#include "Conflicts/Conflict.h"

#include <nlohmann/json_fwd.hpp>
#include <optional>
#include <string>

namespace ovrin {

/// Where a conflict stands among those of all scenes, and how far it is.
struct ItemState {
    std::size_t index = 0, scene = 0;
    bool isOpen = true;
    std::optional<Side> decided = {}, proposed = {};
};

/// A conflict for a page:
///
///     {"index", "scene", "path", "id", "object", "heading", "property", "kind", "what", "isOpen", "decided",
///      "proposed", "words": {"base", "ours", "theirs"}, "choices": {"base", "ours", "theirs"}}
///
/// Words have at most 200 characters each; a choice is what the button of a side says.
nlohmann::json ConflictItem(const Conflict& conflict, const ItemState& state);

} // namespace ovrin
