#pragma once

#include "Conflicts/OpenMerge.h"
#include "Systems/BlobReader.h"

#include <array>
#include <map>
#include <string>

namespace ovrin {

struct Repository;

/// The merges of a working tree as version control keeps them by itself: in git's index. They are there
/// whether or not anybody wrote them down.
class IndexMerges {
public:
    /// The repository must stay.
    explicit IndexMerges(const Repository& repository);

    /// The merge of a scene, without identity and count. Throws Failure that tells what to do where there is
    /// none to be read: one side has removed the file, or the system is another than git.
    OpenMerge Read(const std::string& path);
    /// Whether the texts are those of the index. If not the file was merged again since. True where the index
    /// has none to compare.
    bool Confirm(const OpenMerge& merge);

private:
    using Objects = std::array<std::string, 4>; // by stage; empty for what isn't there

    const Repository& m_Repository;
    BlobReader m_Blobs;
    std::map<std::string, Objects> m_Unmerged;
};

} // namespace ovrin
