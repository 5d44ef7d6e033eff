#pragma once

#include "Commands/CommandTable.h"

namespace ovrin {

/// "ovrin preview BRANCH": which scenes would conflict if it were merged.
Action DescribePreview(CLI::App& command);

} // namespace ovrin
