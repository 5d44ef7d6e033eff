#pragma once

#include "Describe/Program.h"

/// ovrin. Of a value the checks of its option tell which words there are, and its name whether it is a
/// revision or a file. Other operands are files.
DescribedProgram DescribeCompanion();
