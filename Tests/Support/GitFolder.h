#pragma once

#include "Support/Surroundings.h"

#include "Systems/Process.h"
#include "Systems/Repository.h"

#include <gtest/gtest.h>

/// A new repository of git on branch "main", as the present folder and without anybody's settings.
struct GitFolder : testing::Test {
    GitFolder() { Git({"init", "-q", "-b", "main"}); }

    /// Runs git, which must succeed. Returns what it says, without the last line's end.
    static std::string Git(ovrin::CommandWords words) {
        words.insert(words.begin(), "git");
        std::string output = ovrin::OutputOf(words);
        if (output.ends_with('\n')) output.pop_back();
        return output;
    }
    /// Writes files and commits all that is there. Returns the commit.
    std::string Commit(const std::map<std::string, std::string>& files) const {
        for (const auto& [name, text] : files) folder.Write(name, text);
        Git({"add", "-A"});
        Git({"commit", "-q", "--allow-empty", "-m", "change"});
        return Git({"rev-parse", "HEAD"});
    }
    /// Commits on a new branch that goes out from a commit, and stays there.
    std::string CommitOn(const std::string& branch, const std::string& from,
                         const std::map<std::string, std::string>& files) const {
        Git({"checkout", "-q", "-b", branch, from});
        return Commit(files);
    }
    ovrin::Repository Found() const { return ovrin::FindRepository().value(); }

    const surroundings::EmptyHome home;
    const program::WorkingDirectory folder;
    const surroundings::Here here{folder.Path()};
};
