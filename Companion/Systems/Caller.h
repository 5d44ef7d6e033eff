#pragma once

#include <optional>
#include <string>
#include <vector>

namespace ovrin {

/// A command of a version control system, as it was typed.
struct Caller {
    std::string program;            ///< "git", "hg" or "svn"
    std::string command;            ///< "merge", "cherry-pick"...; what stands there of an alias
    std::vector<std::string> words; ///< behind the command
    std::string process = {};       ///< tells its process from all others; empty: not known

    /// Those of the words that don't begin with a dash.
    std::vector<std::string> Operands() const;
};

/// The command that started this process, perhaps through others: that of the nearest process above that
/// belongs to a version control system. Nothing where the machine doesn't tell.
std::optional<Caller> FindCaller();

/// The same of a process's words; nothing for any other program.
std::optional<Caller> CallerOf(const std::vector<std::string>& words);

} // namespace ovrin
