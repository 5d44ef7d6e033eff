#pragma once

#include "Commands/CommandTable.h"

namespace ovrin {

/// "ovrin status": which scenes have open conflicts. With --guard it is what stands in front of a commit.
Action DescribeStatus(CLI::App& command);

} // namespace ovrin
