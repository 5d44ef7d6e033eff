#pragma once

#include <filesystem>
#include <string>

/// The built program, as a user starts it.
namespace program {

namespace fs = std::filesystem;

/// An empty directory, removed with all that is in it at the end of the test.
class WorkingDirectory {
public:
    WorkingDirectory();
    ~WorkingDirectory();

    const fs::path& Path() const { return m_Path; }
    /// Makes the folders above the file as well.
    void Write(const std::string& name, const std::string& content) const;
    /// The content of a file; "<missing>" if it isn't there.
    std::string Read(const std::string& name) const;

    /// Runs a shell command in the directory; its output goes into the files "stdout" and "stderr". Returns
    /// the exit status, 128 and more for a signal. In the command, $OVRIN is the program.
    int Run(const std::string& command) const;

private:
    fs::path m_Path;
};

/// The content of a file; "<missing>" if it isn't there.
std::string ReadFile(const fs::path& path);

} // namespace program
