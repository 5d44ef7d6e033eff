#pragma once

#include "TestResults.h"

namespace self_check {

/// Checks operations applied and merged one by one, and the commands of external tools.
void TestOperations(TestResults& results);

} // namespace self_check
