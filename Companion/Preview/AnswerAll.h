#pragma once

namespace ovrin {

struct PreviewQuestion;
struct Repository;
struct SceneRules;

/// Looks into all scenes of a question, on all processors. The memory that this takes is bounded by the largest
/// scene and by what the machine has.
void LookIntoAll(PreviewQuestion& question, const Repository& repository, const SceneRules& rules);

} // namespace ovrin
