#pragma once

#include <functional>
#include <string>
#include <vector>

namespace ovrin {

/// What kind of file takes lines of the program. This says where the lines are put and what may be kept of a
/// block into which somebody wrote.
enum class FileKind {
    GitConfig, ///< sections, which git changes by itself
    Sections,  ///< sections, which people write
    Lines,     ///< each line stands for itself
    Script,    ///< a shell script: the lines come first, behind that which names the shell
};

/// Lines that a file is to have. Nothing is known of the file yet.
struct Configuration {
    std::string system; ///< "git", "hg" or "svn"
    std::string path;   ///< absolute
    std::string lines;  ///< each with its line end
    FileKind kind;
    /// Looks at the text of the file as it is and as it is to be. Throws Failure where the system would not
    /// read the new one as it is meant. May be empty.
    std::function<void(const std::string& before, const std::string& after)> check;
};

/// What is done to a version control system to set it up.
struct SystemSetup {
    std::string system;
    std::vector<Configuration> files;
    std::vector<std::string> notices; ///< what a person should know besides
    std::vector<std::string> refused; ///< what isn't done, and why
};

/// Whether the set-up is that of the user or that of the repository around the present folder.
enum class Scope { Global, Local };

} // namespace ovrin
