#pragma once

#include "Describe/Program.h"

#include <ostream>

/// Completion of the program for fish.
void WriteFish(std::ostream& out, const DescribedProgram& program);
