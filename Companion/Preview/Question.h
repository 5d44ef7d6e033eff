#pragma once

#include "Preview/Answer.h"
#include "Systems/MergeTree.h"

#include <cstdint>
#include <string>
#include <vector>

namespace ovrin {

struct Repository;

/// What a merge of a revision into what is checked out would meet.
struct PreviewQuestion {
    PreviewAnswer answer;            ///< all scenes in their places, none looked into
    std::vector<UnmergedFile> files; ///< those of the scenes, in the same order
    bool isMergedAlready = false;    ///< nothing is left to merge
};

/// Asks git. Scenes are the files with the attribute merge=ovrin, and those with the names of scenes. Throws
/// Failure where git is too old, the revision isn't there, or the histories don't say what would be merged.
PreviewQuestion AskFor(const Repository& repository, const std::string& revision);

/// What it costs to look into a scene, in about the bytes of its texts.
std::uint64_t CostOf(const UnmergedFile& file);

/// Leaves the scenes of that part.
void Reduce(PreviewQuestion& question, const Part& part);

} // namespace ovrin
