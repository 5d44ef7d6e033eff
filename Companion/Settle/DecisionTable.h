#pragma once

#include "Conflicts/OpenMerge.h"

#include "Merge/ResolveTable.h"

#include <optional>
#include <vector>

namespace ovrin {

/// Tells the side that was decided on at a path, of decisions of which the last that matches counts.
class DecisionTable {
public:
    explicit DecisionTable(const std::vector<Decision>& decisions);

    std::optional<Side> Find(const ovrin_yaml::Path& path) const;

private:
    ovrin_yaml::ResolveTable m_Table;
};

} // namespace ovrin
