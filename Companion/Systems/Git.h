#pragma once

#include "Systems/Process.h"

#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace ovrin {

struct Repository;

/// A version of a file in git's index.
struct GitEntry {
    enum Stage { Merged = 0, Base = 1, Ours = 2, Theirs = 3 };

    std::string path;   ///< from the top of the working tree
    std::string mode;   ///< "100644", "100755", "120000", "160000"
    std::string object; ///< its blob
    Stage stage = Merged;
};

/// git in one repository, called as a program. Paths are bytes, from the top of the working tree, and never
/// patterns. Whatever git refuses is thrown as a Failure with its words.
class Git {
public:
    explicit Git(const Repository& repository);

    /// The same with the index of the working tree, whatever the environment says: git gives its hooks
    /// another one, which holds what is to be committed.
    Git WithOwnIndex() const;
    /// The same with these variables in its environment, in place of others of their names.
    Git With(const std::vector<std::pair<std::string, std::string>>& variables) const;

    /// What a process of git is to be started with, to work here.
    ProcessSetting Setting(std::string input = {}) const;
    ProcessResult Run(CommandWords arguments, std::string input = {}) const;
    std::string Output(CommandWords arguments, std::string input = {}) const;

    /// The versions of all paths that are unmerged, path by path.
    std::vector<GitEntry> Unmerged() const;
    /// Those of all paths, path by path.
    std::vector<GitEntry> Entries() const;
    /// The files of the working tree that git neither tracks nor is told to ignore.
    std::vector<std::string> Untracked() const;
    /// Those of the paths that differ from the last commit, in the index or, if wanted, in the working tree.
    /// All that the index has where there is no commit.
    std::vector<std::string> DifferingFromHead(const std::vector<std::string>& paths,
                                               bool inIndexAlone) const;
    /// Whether two commits have the same at a path.
    bool IsSameIn(const std::string& commit, const std::string& other, const std::string& path) const;
    /// Whether a file of the working tree, as git would store it, is these bytes.
    bool StoresAs(const std::string& path, const std::string& bytes) const;
    /// The commit that a name stands for; empty if it is none.
    std::string Commit(const std::string& name) const;
    /// What a person would call the commit: a branch or tag, "main", "origin/main", "v1.0", or the first
    /// digits of its number.
    std::string NameOfCommit(const std::string& commit) const;
    std::optional<std::string> ConfigValue(const std::string& name) const;
    /// Takes the files, as they stand, into the index: whatever was unmerged about them is settled then.
    void Add(const std::vector<std::string>& paths) const;

private:
    std::string m_Folder;
    std::string m_Data;
    std::vector<std::pair<std::string, std::string>> m_Environment;
};

} // namespace ovrin
