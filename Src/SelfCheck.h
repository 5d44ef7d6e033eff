#pragma once

#include "ExitStatus.h"

/// Runs the built-in checks and prints a line for each. Returns Done also where checks fail; Failed only
/// where one throws.
ExitStatus RunUnitttests();
