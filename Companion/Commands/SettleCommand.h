#pragma once

#include "Commands/CommandTable.h"

namespace ovrin {

/// "ovrin settle": settles the open conflicts of scenes by decisions that a script or a line gives.
Action DescribeSettle(CLI::App& command);

} // namespace ovrin
