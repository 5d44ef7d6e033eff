#pragma once

#include <string>

namespace ovrin {

/// How a version control system is to call this program: by its name, where that is found in a folder of
/// programs that every system searches, by its path otherwise. A program with windows is often started
/// without the path of the user's shell, and its version control then searches few folders.
struct ProgramCall {
    std::string name; ///< "ovrin", or the path of it that an upgrade leaves valid

    /// For a shell, quoted where that is needed.
    std::string ForShell() const;
    /// The name under which the program is a merge tool of Subversion, which passes no arguments of ours.
    std::string ForSubversion() const;
};

/// The call of the program that is running. A `name` that isn't empty is taken as it is.
ProgramCall CallOfThisProgram(const std::string& name = {});

/// `word` so that a shell takes it as one word; as it is where no quotes are needed.
std::string ShellWord(const std::string& word);

} // namespace ovrin
