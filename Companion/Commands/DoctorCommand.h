#pragma once

#include "Commands/CommandTable.h"

namespace ovrin {

/// ovrin doctor [--fix] [--json]
Action DescribeDoctor(CLI::App& command);

} // namespace ovrin
