#pragma once

#include "Describe/Program.h"

#include <ostream>

// Lines that the manual pages and the README must have, which check-manuals compares.

/// OvrinMerge diff [--rules FILE] [-h] LEFT RIGHT [DEST]
void WriteSynopsis(std::ostream& out, const DescribedProgram& program);

/// The options of the first command, which has those of all others.
void WriteOptions(std::ostream& out, const DescribedProgram& program);
void WriteReadmeTable(std::ostream& out, const DescribedProgram& program);

/// The names of the commands.
void WriteCommands(std::ostream& out, const DescribedProgram& program);

/// For each command "name word" with each option and operand of it, or the words that the operand may be.
void WriteWords(std::ostream& out, const DescribedProgram& program);
