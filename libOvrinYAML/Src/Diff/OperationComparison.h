#pragma once

#include "Diff/Operation.h"

#include <set>
#include <utility>

namespace ovrin_yaml {

/// Finds out whether two operations are the same change: of one kind, with equal values, at the same keys in
/// the same order, with the same key order and the same moves. m_Mergeable doesn't count.
///
/// A merge of nested lists asks about the whole first, then about the parts level by level; so pairs of list
/// changes that were found unequal are remembered. Belongs to one thread.
class OperationComparison {
public:
    bool AreEqual(const Operation* first, const Operation* second);

private:
    bool DiffsAreEqual(const YAMLMappingDiff* first, const YAMLMappingDiff* second);
    bool ListChangesAreEqual(const ChangeSequenceOperation* first, const ChangeSequenceOperation* second);

    std::set<std::pair<const Operation*, const Operation*>> m_Unequal; // asked for single pairs only
};

/// The same for a single question.
bool OperationEquals(const Operation* first, const Operation* second);

} // namespace ovrin_yaml
