#pragma once

/// Runs the built-in checks and prints a line for each. Returns the exit status of the process, which is 0
/// also where checks fail.
int RunUnitttests();
