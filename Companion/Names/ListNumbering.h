#pragma once

#include "Diff/MergeRules.h"
#include "Diff/Operation.h"

#include <optional>
#include <unordered_map>
#include <vector>

namespace ovrin {

/// How a merge numbered the elements of a list that both sides changed, found again from the two changes:
///
///     base A B C     theirs A x B C     ours A B y C     merged A x B y C
///     merged index 1 is index 1 of theirs and nothing else; 2 is 1 of base, 2 of theirs, 1 of ours
class ListNumbering {
public:
    /// The left side's change is that of theirs; null where a side didn't change the list. `rule` is the
    /// list's.
    ListNumbering(const ovrin_yaml::ChangeSequenceOperation* theirs,
                  const ovrin_yaml::ChangeSequenceOperation* ours, const ovrin_yaml::ListRule& rule);

    /// The element's index in each version, -1 where a version lacks it.
    struct Indexes {
        int base = -1, ours = -1, theirs = -1;
    };
    /// Of an element by its index in the merged list.
    Indexes Merged(int index) const;
    /// Of one that both sides added under one key; the merge tells it by its index in theirs.
    std::optional<Indexes> AddedByBoth(int index) const;

private:
    void NumberByBoth(const ovrin_yaml::ChangeSequenceOperation& theirs,
                      const ovrin_yaml::ChangeSequenceOperation& ours, const ovrin_yaml::ListRule& rule);
    void NumberByOne(const ovrin_yaml::YAMLSequenceRemapper& remapper, int Indexes::*side,
                     int Indexes::*other);
    Indexes& At(int index);

    bool m_IsIdentity = false; // no element was added, removed or moved
    std::vector<Indexes> m_Elements;
    std::unordered_map<int, int> m_AddedByBoth; // index in theirs to that in ours
};

} // namespace ovrin
