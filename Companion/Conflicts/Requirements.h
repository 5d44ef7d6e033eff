#pragma once

#include "Conflicts/OpenMerge.h"

#include "Session/MergeSession.h"

#include <vector>

namespace ovrin {

/// The components that a side added and that need the object `id`, which the version `side` lacks: they
/// require it, or belong to it if it is a GameObject. They go with it where that version is taken. In the
/// order of the GameObject's list, ours ahead of theirs.
std::vector<const ovrin_yaml::YAMLScalar*> NeededBy(ovrin_yaml::MergeSession& session,
                                                    const ovrin_yaml::YAMLScalar* id, Side side);

} // namespace ovrin
