#pragma once

#include <string>

namespace ovrin {

/// A new folder in the temporary directory, of this user alone, for as long as this lives. A signal that
/// would end the program, such as from the keyboard, does so when the folder is gone. One at a time.
class ScratchFolder {
public:
    /// Throws Failure.
    ScratchFolder();
    ScratchFolder(const ScratchFolder&) = delete;
    ScratchFolder& operator=(const ScratchFolder&) = delete;
    ~ScratchFolder();

    /// The path of a new folder in it. Throws Failure.
    std::string NewFolder(const std::string& name) const;
    /// The path of a file in it, which isn't there.
    std::string File(const std::string& name) const { return m_Path + "/" + name; }

private:
    std::string m_Path;
};

} // namespace ovrin
