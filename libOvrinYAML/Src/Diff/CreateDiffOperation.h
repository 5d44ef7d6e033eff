#pragma once

#include "Diff/Operation.h"

namespace ovrin_yaml {

struct DiffContext;

/// The one place that decides which operation, if any, turns `base` into `dest`, two nodes at one path.
/// Either may be null (absent); null is returned where they count as equal.
///
/// Both trees must be hashed: equal hashes count as equal contents. The operation points into `dest`.
/// Throws YAMLError with the duplicate-keys text when it has to look into a mapping in the duplicate state.
/// Callable from several threads over one base.
const Operation* CreateDiffOperation(DiffContext& context, const YAMLNode* base, const YAMLNode* dest);

/// Whether two nodes, either of which may be null, count as equal without a look inside. The diffs ask before
/// they build the path of a pair of children.
bool CountAsEqual(const YAMLNode* base, const YAMLNode* dest);

/// Whether two scalars that aren't the same differ by more than the tolerance for their path.
bool ScalarsDiffer(const DiffContext& context, const YAMLScalar* base, const YAMLScalar* dest);

} // namespace ovrin_yaml
