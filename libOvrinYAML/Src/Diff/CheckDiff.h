#pragma once

#include "Diff/YAMLMappingDiff.h"

#include <string>

namespace ovrin_yaml {

/// What a diff was made of.
enum class DiffOrigin {
    Trees, ///< two trees
    Sides  ///< the diffs of two sides
};

/// Checks the invariants of a diff. Returns the first fault and the path to it; empty if there is none.
///
///  - no key has two operations, and every operation is there and brings the value that its kind needs;
///  - the entries of a sequence ascend;
///  - a remapper leads nowhere but into the destination.
///
/// Of a diff of two trees also: what leads to no base element is added, and nothing changes beyond the
/// destination. A merge that keeps the base at a conflict may leave a place empty.
std::string CheckDiff(const YAMLMappingDiff& diff, DiffOrigin origin);

} // namespace ovrin_yaml
