#include "Setup/UserFolders.h"

#include "Words/Failure.h"

#include <cstdlib>

namespace ovrin {

std::string VariableOf(const char* name) {
    const char* value = std::getenv(name);
    return value ? value : "";
}

std::string HomeFor(const std::string& system) {
    std::string home = VariableOf("HOME");
    while (home.size() > 1 && home.ends_with('/')) home.pop_back();
    if (home.starts_with('/')) return home;
    throw Failure("HOME is " + (home.empty() ? "not set" : "\"" + home + "\", which is no absolute path") +
                  ", so that " + system + " has no settings of the user: set HOME");
}

std::string SettingsFolderFor(const std::string& system) {
    const std::string folder = VariableOf("XDG_CONFIG_HOME");
    return folder.empty() ? HomeFor(system) + "/.config" : folder;
}

} // namespace ovrin
