#pragma once

#include "Changes/SceneChange.h"
#include "Systems/ChangedFile.h"

#include "Diff/MergeRules.h"

#include <optional>
#include <string>

namespace ovrin {

/// What changed in a file.
struct FileChange {
    FilePair file;
    std::optional<SceneChange> scene; ///< where both versions could be read as scenes
    /// Why not, for a file that is meant to be a scene; a sentence without a full stop. Empty for any other
    /// file.
    std::string reason;
    std::string lines = {}; ///< what changed by lines, as far as that was asked for
};

/// How values are told.
struct ChangeWish {
    std::size_t width = 0;   ///< characters of a value; 0: all
    bool withValues = false; ///< fields of added and removed objects too
};

/// Compares the versions of a file by objects, if it is a scene in both. Throws Failure for versions that
/// can't be had.
FileChange CompareFile(const ChangedFile& changed, const ovrin_yaml::MergeRules& rules,
                       const ChangeWish& wish);

} // namespace ovrin
