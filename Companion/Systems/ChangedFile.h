#pragma once

#include <functional>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace ovrin {

/// How a file came from one version to the other.
enum class FileStatus { Added, Removed, Changed, Renamed, Copied, Unmerged };

/// A file of two versions. Paths are of any bytes.
struct FilePair {
    FileStatus status = FileStatus::Changed;
    std::string oldPath, newPath; ///< the same but for renames and copies
};

/// Asked of the first bytes of a file, all or BlobReader::kBeginning of them: whether the rest is wanted.
using IsWanted = std::function<bool(std::string_view)>;
/// Gives the bytes of a version of a file, or nothing if they aren't wanted. Throws Failure. Null for a
/// version that isn't there, or is no file: a link, a submodule.
using FileVersion = std::function<std::optional<std::string>(const IsWanted&)>;

struct ChangedFile {
    FilePair file;
    FileVersion before, after;
};

/// The files that differ between two versions of a tree.
struct ChangedFiles {
    std::vector<ChangedFile> files;
    /// What changed in some of them by lines, as the system tells it.
    std::function<std::string(std::span<const FilePair>)> lines;
    std::string before, after; ///< what people call the versions; empty where that isn't known
};

/// What is to be compared: no revision, or one or two, as the system's own diff takes them.
struct ComparisonWish {
    std::vector<std::string> revisions;
    std::vector<std::string> paths; ///< of files and folders, from the present folder; none: all
    bool isStaged = false;          ///< the index of git, in place of the working tree
};

/// A file of the disk.
FileVersion VersionOnDisk(const std::string& path);

} // namespace ovrin
