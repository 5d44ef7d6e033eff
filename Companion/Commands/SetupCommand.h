#pragma once

#include "Commands/CommandTable.h"

namespace ovrin {

/// ovrin setup [git|hg|svn] [--local|--global] [--undo] [--dry-run] [--program NAME]
Action DescribeSetup(CLI::App& command);

} // namespace ovrin
