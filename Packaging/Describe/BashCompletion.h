#pragma once

#include "Describe/Program.h"

#include <ostream>

/// Completion of the program for bash.
void WriteBash(std::ostream& out, const DescribedProgram& program);
