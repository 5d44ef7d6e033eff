#pragma once

#include "Diff/Operation.h"
#include "Values/YAMLSequence.h"

#include <set>
#include <utility>
#include <vector>

namespace ovrin_yaml {

struct DiffContext;
class MergeRules;
class YAMLSequenceRemapper;

/// The per-position half of a change to a sequence; YAMLSequenceRemapper is the other half.
///
/// The contract between diffing, merging and applying: first the remap, then the operations in ascending
/// index, each at a destination index (after the remap, never a base index), and nothing shifts. At an index
/// that no base element was mapped to stands an AddOperation; at one with a matched element that differs, a
/// change.
///
///     base A B C    destination C A' D   (A' is A with a changed field, matched by key)
///     remapper 1, -1, 0   count 3        operations  1: ChangeMappingOperation   2: AddOperation(D)
///
/// A diff doesn't own its operations.
class YAMLSequenceDiff {
public:
    struct Entry {
        int index;
        const Operation* operation; // null only while a list merge settles additions of both sides
    };

    /// The position-by-position diff; `base` may hold holes where it was arranged by a remapper.
    static YAMLSequenceDiff* Diff(DiffContext& context, const NodeList& base, const NodeList& dest);
    static YAMLSequenceDiff* Diff(const MergeRules& rules, const YAMLSequence* base,
                                  const YAMLSequence* dest);

    /// Throws YAMLError "Cannot do a double change on the same key in a sequence".
    void Add(int index, const Operation* operation);
    /// Throws YAMLError "Cannot replace non-existing key in a sequence".
    void Replace(int index, const Operation* operation);
    /// Takes the given indexes out of the index space: their entries go, later ones move forward.
    void RemoveAndShiftMany(const std::set<int>& indexes);
    /// The same operations at their targets. An entry without one is dropped; of two with one target the
    /// later stays.
    YAMLSequenceDiff* Remap(const YAMLSequenceRemapper* remapper) const;
    /// Carries out the operations, without any remap.
    void Apply(YAMLSequence& target) const;
    /// In ascending index.
    const std::vector<Entry>& Entries() const { return m_Entries; }
    /// The entry's operation, or null.
    const Operation* Find(int index) const;

    void ResetForAlloc() { m_Entries.clear(); }

private:
    std::vector<Entry>::iterator LowerBound(int index);

    std::vector<Entry> m_Entries; // ascending index
};

} // namespace ovrin_yaml
