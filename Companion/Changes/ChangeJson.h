#pragma once

#include "Changes/FileChange.h"

#include <span>
#include <string>

namespace ovrin {

/// What changed, as JSON of these fields; what has no value is left out:
///
///     {"files": [{"path", "oldPath", "status": "added|removed|changed|renamed|copied|unmerged",
///                 "isScene", "reason",
///                 "added", "removed", "changed", "moved",
///                 "objects": [{"id", "name", "change": "added|removed|changed|moved",
///                              "isMoved", "formerParent",
///                              "properties": [{"place", "change", "before", "after"}]}]}]}
std::string ChangeJson(std::span<const FileChange> changes);

} // namespace ovrin
