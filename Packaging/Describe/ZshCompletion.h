#pragma once

#include "Describe/Program.h"

#include <ostream>

/// Completion of the program for zsh.
void WriteZsh(std::ostream& out, const DescribedProgram& program);
