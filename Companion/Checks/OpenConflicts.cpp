#include "Checks/OpenConflicts.h"

#include "Conflicts/LiveMerges.h"
#include "Conflicts/OpenMerges.h"

namespace ovrin {

OpenConflicts::OpenConflicts(const Repository& repository) {
    const OpenMerges store(repository);
    const LiveMerges merges = FindLiveMerges(repository, store);
    for (const OpenMerge& merge : merges.live) {
        const std::size_t open = store.ProgressOf(merge).open;
        m_Messages[merge.path] = open ? "has " + std::to_string(open) +
                                            (open == 1 ? " open conflict" : " open conflicts") +
                                            "; \"ovrin settle\" settles them"
                                      : "isn't settled yet; \"ovrin settle\" completes it";
    }
    for (const std::string& path : merges.unrecorded)
        m_Messages[path] = "is unmerged: settle it, and tell version control that it is";
}

std::optional<Finding> OpenConflicts::Find(const std::string& path) const {
    const auto found = m_Messages.find(path);
    if (found == m_Messages.end()) return std::nullopt;
    Finding finding{Code::OpenConflict};
    finding.message = "the file " + found->second;
    return finding;
}

} // namespace ovrin
