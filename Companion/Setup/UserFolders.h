#pragma once

#include <string>

namespace ovrin {

/// The home directory. Throws Failure where HOME doesn't name one: `system` then reads no file of the user.
std::string HomeFor(const std::string& system);

/// The folder for the settings of programs, by XDG_CONFIG_HOME or below the home directory.
std::string SettingsFolderFor(const std::string& system);

/// The value of an environment variable; empty where it isn't set.
std::string VariableOf(const char* name);

} // namespace ovrin
