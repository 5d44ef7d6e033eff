#pragma once

#include "Conflicts/OpenMerge.h"
#include "Preview/Answer.h"
#include "Systems/MergeTree.h"

#include "Session/Thread.h"

namespace ovrin {

struct SceneRules;

/// What can be told of a scene without a look into it: what the two sides did to it, and what git itself
/// would leave unmerged.
PreviewedScene PlaceScene(const UnmergedFile& file, const NamedCommit& ours, const NamedCommit& theirs);

/// Whether a look into the scene tells more.
bool IsMerged(const UnmergedFile& file);

/// Notes why nothing is known of what a merge would make of the scene.
void MakeUnknown(PreviewedScene& scene, const std::string& why);

/// Merges the texts of a scene to see what becomes of it. Whatever is wrong with them is part of the answer.
void LookInto(PreviewedScene& scene, const ThreeTexts& texts, const PreviewAnswer& question,
              const SceneRules& rules, ovrin_yaml::Threads threads);

} // namespace ovrin
