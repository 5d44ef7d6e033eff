#pragma once

#include "Checks/Finding.h"

#include <map>
#include <optional>
#include <string>

namespace ovrin {

struct Repository;

/// The scenes of a working tree whose merges wait for a person.
class OpenConflicts {
public:
    /// Knows of none.
    OpenConflicts() = default;
    /// Throws Failure where version control or what it keeps can't be asked.
    explicit OpenConflicts(const Repository& repository);

    /// What there is to say of the scene with this path from the top of the working tree.
    std::optional<Finding> Find(const std::string& path) const;

private:
    std::map<std::string, std::string> m_Messages; // by path
};

} // namespace ovrin
