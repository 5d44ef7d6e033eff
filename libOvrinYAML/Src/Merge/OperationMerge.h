#pragma once

#include "Diff/Operation.h"

namespace ovrin_yaml {

class ConflictResolver;

/// What enters the merged diff for one key or index: one call of the resolver, or none where neither side has
/// an operation. Either side may be null, and so may the result: the base value stays.
const Operation* MergeOperations(const Operation* left, const Operation* right, ConflictResolver& resolver);

/// The diffs of two changed mappings merged into a new operation; never null.
const ChangeMappingOperation* MergeMappingChanges(const ChangeMappingOperation* left,
                                                  const ChangeMappingOperation* right,
                                                  ConflictResolver& resolver);

} // namespace ovrin_yaml
