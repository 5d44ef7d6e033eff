#pragma once

#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace ovrin {

class Git;

/// A version of git, as far as features come with it.
struct GitVersion {
    int major, minor;

    bool IsOlderThan(const GitVersion& other) const {
        return std::pair(major, minor) < std::pair(other.major, other.minor);
    }
    std::string Text() const { return std::to_string(major) + "." + std::to_string(minor); }
};

/// The one that is on the path. Throws Failure if there is none, or none that tells its version.
GitVersion InstalledGit();

/// A commit, and what a person calls it.
struct NamedCommit {
    std::string name, id;
};

/// The commit of any revision, or nothing if there is no such revision. Throws Failure where git can't look.
std::optional<std::string> FindCommit(const Git& git, const std::string& revision);

/// What is checked out: the name of the branch or, without one, the first digits of the commit. Throws
/// Failure where there is no commit yet.
NamedCommit CheckedOut(const Git& git);

/// The names of all branches and tags, short as people write them.
std::vector<std::string> RevisionNames(const Git& git);

/// The best common ancestors of two commits, in no order that means anything; none if there aren't any.
/// Throws Failure, with the cure, where a shallow clone lacks what decides about them.
std::vector<std::string> MergeBases(const Git& git, const NamedCommit& ours, const NamedCommit& theirs);

} // namespace ovrin
