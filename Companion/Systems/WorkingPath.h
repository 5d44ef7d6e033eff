#pragma once

#include <string>

namespace ovrin {

struct Repository;

/// The path from the top of the working tree of a file or folder that the user names from where the program
/// runs; "." for the top itself. It need not be there; links on the way to it are followed. Throws Failure
/// for one outside of the working tree.
std::string WorkingPath(const Repository& repository, const std::string& given);

/// Whether `path` is `place` or lies in the folder `place`; both from the top of the working tree.
bool IsAtOrBelow(const std::string& path, const std::string& place);

} // namespace ovrin
