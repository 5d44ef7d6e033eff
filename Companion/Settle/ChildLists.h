#pragma once

#include "Conflicts/OpenMerge.h"

#include <vector>

namespace ovrin_yaml {
class YAMLScalar;
}

namespace ovrin {

class SceneMerge;

/// What follows for the lists of children when `side` is taken for the parent of a Transform: where a side
/// whose move is dropped changed nothing but the place of that child in a list, the other side's list is
/// taken. Lists that it changed in other ways are left to the merge.
std::vector<Decision> DecideChildLists(SceneMerge& merge, const ovrin_yaml::YAMLScalar* transform, Side side);

} // namespace ovrin
