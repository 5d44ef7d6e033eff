#pragma once

#include "Diff/Operation.h"

namespace ovrin_yaml {

class MergeRules;

/// The change of the key list from `base` to `dest`; an identity where the order is the same.
const ChangeSequenceOperation* DiffKeyOrder(const MergeRules& rules, const YAMLMapping* base,
                                            const YAMLMapping* dest);

/// Whether the key list stays as it is: no element moves and no operation touches one.
bool IsIdentityKeyOrder(const ChangeSequenceOperation* order);

/// Brings the keys of `target`, whose pairs have been changed already, into the merged order. `before` holds
/// the keys of `target` as they were. Throws YAMLError "Unmapped key when trying to reorder mapping keys".
void ApplyKeyOrder(const ChangeSequenceOperation* order, std::vector<const YAMLScalar*> before,
                   YAMLMapping& target);

} // namespace ovrin_yaml
