#pragma once

#include "Describe/Program.h"

/// ovrin. Of an argument the checks of its option tell which words there are, and its name whether it is a
/// revision; anything else may be a file.
DescribedProgram DescribeCompanion();
