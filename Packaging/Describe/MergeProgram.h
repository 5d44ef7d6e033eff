#pragma once

#include "Describe/Program.h"

/// OvrinMerge.
DescribedProgram DescribeMerge();
