#pragma once

#include "TestResults.h"

namespace self_check {

/// Checks diffs made, merged and applied: mappings and sequences.
void TestDiffs(TestResults& results);

} // namespace self_check
