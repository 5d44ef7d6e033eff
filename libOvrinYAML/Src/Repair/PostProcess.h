#pragma once

#include "Merge/RecordingConflictResolver.h"
#include "Repair/ObjectAccess.h"
#include "Repair/YAMLTypeInfo.h"

namespace ovrin_yaml {

/// Repairs the object graph of a merged file, in place: left and right are only read, so that several merged
/// files may be repaired at once beside the same sides. In this order:
///  1. prefab links of Transforms: a link to a prefab that a side removed becomes 0 if the GameObject is
///     still there; if not, the Transform goes too;
///  2. parents, and the search for cycles (TransformCycles.h);
///  3. dangling prefab links of any object become 0, and a stripped Transform that has one is removed;
///  4. the transitions of state machines get their stored form back (PreProcess.h).
/// Throws what these throw, and the duplicate-keys YAMLError for a repeated key anywhere in the merged file.
void PostProcessMergeOnly(RepairRoots roots, ConflictResolver& resolver);

/// The same, and then the check of component dependencies (ComponentDependencies.h) by `types`. Returns
/// whether that found broken ones, each of which is a conflict.
bool PostProcess(RepairRoots roots, const YAMLTypeInfoManager& types, RecordingConflictResolver& resolver);

} // namespace ovrin_yaml
