#pragma once

#include "Diff/Operation.h"

namespace ovrin_yaml {

class ConflictResolver;

/// The changes of two sides to one sequence, brought into one numbering and merged; never null. With
/// `removeUnmatched` an element that one side removed is gone, without it the other side keeps it.
const ChangeSequenceOperation* MergeSequenceChanges(const ChangeSequenceOperation* left,
                                                    const ChangeSequenceOperation* right,
                                                    ConflictResolver& resolver, bool removeUnmatched);

} // namespace ovrin_yaml
