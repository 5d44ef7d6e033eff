#pragma once

#include "Commands/CommandTable.h"

namespace ovrin {

/// "ovrin diff": what changed between two versions of scenes.
Action DescribeDiff(CLI::App& command);

} // namespace ovrin
