#pragma once

#include <cstddef>
#include <functional>

namespace ovrin {

struct PreviewQuestion;
struct Repository;
struct SceneRules;

/// Looks into all scenes of a question, on all processors. Each process takes a bounded share of the work,
/// and all together no more memory than the machine can give, unless a single scene does. `watch` is told
/// after each scene how many are done, of how many.
void LookIntoAll(PreviewQuestion& question, const Repository& repository, const SceneRules& rules,
                 const std::function<void(std::size_t done, std::size_t all)>& watch);

} // namespace ovrin
