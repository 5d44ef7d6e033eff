#pragma once

#include "Diff/Operation.h"
#include "Values/YAMLScalar.h"

#include <vector>

namespace ovrin_yaml {

/// An element that both sides added under one key.
struct CommonAddition {
    int leftIndex, rightIndex; // in the numbering of each side
    const AddOperation* left;
    const AddOperation* right;
};

/// The common additions of two diffs of one list, whose elements have these keys, in the order of the left
/// side.
std::vector<CommonAddition> FindCommonAdditions(const YAMLSequenceDiff& left, const YAMLSequenceDiff& right,
                                                const std::vector<Path>& keyPaths);

} // namespace ovrin_yaml
