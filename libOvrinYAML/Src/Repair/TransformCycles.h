#pragma once

#include "Merge/YAMLConflict.h"
#include "Repair/ObjectAccess.h"

namespace ovrin_yaml {

/// Checks the Transform hierarchy of the merged file.
///
/// First the parents of all Transforms: one that a side removed is replaced by none in the tree. Then every
/// Transform whose parent the merge visited is followed upward:
///
///     start -> parent -> parent -> 0        fine
///     start -> parent -> start              a cycle, given to the resolver
///     start -> 100 parents                  taken for a cycle, which need not contain the start
///
/// A loop among Transforms that the merge didn't visit is not looked for. A visited Transform with a removed
/// parent is a failure although that parent was replaced.
/// Throws YAMLError for a stripped Transform with no prefab link, std::runtime_error where a start or a
/// parent on the way is no Transform of the merged file.
void CheckTransformHierarchy(const RepairRoots& roots, ConflictResolver& resolver);

} // namespace ovrin_yaml
