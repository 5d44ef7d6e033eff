#pragma once

#include "Diff/MergeRules.h"

#include <array>
#include <cstddef>
#include <optional>
#include <span>
#include <vector>

namespace ovrin {

/// An element in several versions of a list: its index in each, -1 where a version lacks it.
using ElementIndexes = std::array<int, 4>;

/// Finds the elements of versions of a list that are the same, by the keys that `rule` gives them: all
/// elements of the last version in its order, then what only others have, version by version. Nothing where
/// the rule has no keys, a version is no list, or an element lacks its key or has that of another.
std::optional<std::vector<ElementIndexes>>
MatchElements(const std::array<const ovrin_yaml::YAMLNode*, 4>& lists, const ovrin_yaml::ListRule& rule);

} // namespace ovrin
