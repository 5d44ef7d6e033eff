#pragma once

#include "Setup/Configuration.h"

#include <string>
#include <vector>

namespace ovrin {

/// Where git keeps what the set-up writes. All paths are absolute; all functions throw Failure where git
/// can't tell, or has no such place.

/// The configuration files, the one first that `git config` would write to. That of a repository is shared by
/// its working trees.
std::vector<std::string> GitConfigs(Scope scope);
/// The attributes files, the one first that git reads. That of a repository is the one that nobody commits,
/// which wins over all others.
std::vector<std::string> GitAttributes(Scope scope);
/// The folder of the repository's hooks, whether it is there or not; empty where nobody commits: the
/// repository has no working tree.
std::string GitHooks();

/// The names and values that git reads from a configuration of this text, as "NAME\nVALUE". Throws Failure
/// with git's words if it can't read it.
std::vector<std::string> EntriesOfGitConfig(const std::string& text);

} // namespace ovrin
