#pragma once

#include <optional>
#include <string>

namespace ovrin {

/// The version control systems that the program works with.
enum class SystemKind { Git, Mercurial, Subversion };

/// A working tree of a version control system, or a repository without one.
struct Repository {
    SystemKind kind;
    std::string top;  ///< the working tree's folder, absolute; empty for a repository without one
    std::string data; ///< the folder of what the system keeps of this working tree: a git dir, .hg or .svn
};

/// The innermost one around `folder`, or nothing. What git's environment says of its folders counts. No
/// program is started: this is asked for each file of a merge.
std::optional<Repository> FindRepository(const std::string& folder = ".");

} // namespace ovrin
