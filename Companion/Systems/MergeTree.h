#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace ovrin {

struct Repository;

/// What stands in a commit under the name of a file.
struct TreeEntry {
    std::string id;     ///< of the blob
    bool isFile;        ///< not a link or a submodule
    std::uint64_t size; ///< in bytes; 0 for what is no file
};

/// A file that git, merging two commits, can't settle by names and identities alone.
struct UnmergedFile {
    std::string path; ///< in the result, from the top; any bytes
    std::optional<TreeEntry> base, ours, theirs;
    /// git's names of its conflicts other than that of two contents: "modify/delete". Sorted.
    std::vector<std::string> conflicts;
    /// The name in theirs where the sides renamed it differently, and `path` is that of ours; else empty.
    /// What ours and theirs have then is what git made of them.
    std::string pathInTheirs;
    bool isByObjects = false; ///< has the attribute merge=ovrin

    /// Bytes of all versions.
    std::uint64_t Size() const {
        return (base ? base->size : 0) + (ours ? ours->size : 0) + (theirs ? theirs->size : 0);
    }
};

/// The files that both commits changed, or in whose way they are else, in the order of their paths: what the
/// merge of git, with its renames and its merged bases, has to merge by contents, and what it would leave
/// unmerged. No content is merged, and nothing is written into the repository. Needs git 2.38. Throws
/// Failure.
std::vector<UnmergedFile> ListUnmerged(const Repository& repository, const std::string& ours,
                                       const std::string& theirs);

} // namespace ovrin
