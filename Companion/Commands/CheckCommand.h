#pragma once

#include "Commands/CommandTable.h"

namespace ovrin {

/// Tells what is wrong with scenes.
Action DescribeCheck(CLI::App& command);

} // namespace ovrin
