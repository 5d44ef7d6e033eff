#pragma once

#include "Commands/CommandTable.h"

namespace ovrin {

/// "ovrin review": shows a difference or a merge of scenes as a page, and decides nothing.
Action DescribeReview(CLI::App& command);

} // namespace ovrin
