#pragma once

#include "Commands/CommandTable.h"

#include <string>
#include <vector>

namespace ovrin {

/// Adds the options of "merge": how version control has a scene merged.
Action DescribeMerge(CLI::App& command);

/// The arguments of the program that was called by that name with these words. As "ovrin-svn" it is what
/// Subversion calls as its merge tool, with BASE THEIRS MINE MERGED PATH.
std::vector<std::string> ArgumentsFor(const std::string& program, std::vector<std::string> words);

} // namespace ovrin
