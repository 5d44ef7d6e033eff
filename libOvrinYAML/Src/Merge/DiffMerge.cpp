#include "Merge/DiffMerge.h"

#include "Diff/KeyOrder.h"
#include "Merge/OperationMerge.h"
#include "Merge/SequenceMerge.h"
#include "Merge/YAMLConflict.h"

namespace ovrin_yaml {

namespace {

/// Merges the changes of two key lists. Every diff of two trees has one, changed or not, so that an order
/// that one side alone moved is merged with the other side's unmoved one, and lost, wherever both sides have
/// a diff of the mapping. A key that one side dropped stays in the merged list: whether it is there is
/// decided by its entry.
const ChangeSequenceOperation* MergeKeyOrder(const ChangeSequenceOperation* left,
                                             const ChangeSequenceOperation* right,
                                             ConflictResolver& resolver) {
    if (!left || !right) return right ? right : left;
    if (left == right && IsIdentityKeyOrder(left)) return left;
    WalkedPath path = Path{YAMLScalar::underscore};
    std::swap(path, resolver.m_Path);
    const ChangeSequenceOperation* merged = MergeSequenceChanges(left, right, resolver, false);
    std::swap(path, resolver.m_Path);
    return merged;
}

/// Finds the operations of a diff for keys that mostly come in its own order: behind the one found last is
/// looked first.
class AlignedFind {
public:
    explicit AlignedFind(const YAMLMappingDiff* diff) : m_Diff(*diff) {}

    /// The operation for `key`, or null.
    const Operation* operator()(const YAMLScalar* key) {
        const auto& entries = m_Diff.Entries();
        if (m_Next >= entries.size() || entries[m_Next].key != key) {
            const std::uint32_t found = m_Diff.IndexOf(key);
            if (found == KeyIndex::kMissing) return nullptr;
            m_Next = found;
        }
        return entries[m_Next++].operation;
    }

private:
    const YAMLMappingDiff& m_Diff;
    std::size_t m_Next = 0;
};

/// The keys of two diffs: by their index in the diff that has them, the left one if both do; of two keys with
/// one index the left diff's goes first.
template <class Visit>
void ForEachKey(const YAMLMappingDiff* left, const YAMLMappingDiff* right, const Visit& visit) {
    const auto& leftEntries = left->Entries();
    const auto& rightEntries = right->Entries();
    AlignedFind inLeft(left), inRight(right);
    for (std::size_t index = 0; index < std::max(leftEntries.size(), rightEntries.size()); ++index) {
        if (index < leftEntries.size())
            visit(leftEntries[index].key, leftEntries[index].operation, inRight(leftEntries[index].key));
        if (index < rightEntries.size() && !inLeft(rightEntries[index].key))
            visit(rightEntries[index].key, nullptr, rightEntries[index].operation);
    }
}

} // namespace

YAMLMappingDiff* MergeMappingDiffs(const YAMLMappingDiff* left, const YAMLMappingDiff* right,
                                   ConflictResolver& resolver) {
    YAMLMappingDiff* merged = YAMLAlloc<YAMLMappingDiff>::create();
    merged->m_KeyOrder = MergeKeyOrder(left->m_KeyOrder, right->m_KeyOrder, resolver);
    ForEachKey(left, right, [&](const YAMLScalar* key, const Operation* leftOne, const Operation* rightOne) {
        resolver.PushPath(key);
        if (const Operation* operation = MergeOperations(leftOne, rightOne, resolver))
            merged->Add(key, operation);
        resolver.PopPath();
    });
    return merged;
}

YAMLSequenceDiff* MergeSequenceDiffs(const YAMLSequenceDiff* left, const YAMLSequenceDiff* right,
                                     std::set<int>& droppedIndexes, ConflictResolver& resolver) {
    YAMLSequenceDiff* merged = YAMLAlloc<YAMLSequenceDiff>::create();
    auto l = left->Entries().begin();
    auto r = right->Entries().begin();
    const auto leftEnd = left->Entries().end();
    const auto rightEnd = right->Entries().end();
    while (l != leftEnd || r != rightEnd) {
        const int index = r == rightEnd || (l != leftEnd && l->index < r->index) ? l->index : r->index;
        const Operation* leftOne = l != leftEnd && l->index == index ? (l++)->operation : nullptr;
        const Operation* rightOne = r != rightEnd && r->index == index ? (r++)->operation : nullptr;
        resolver.PushPath(IndexScalar(index));
        if (const Operation* operation = MergeOperations(leftOne, rightOne, resolver))
            merged->Add(index, operation);
        else
            droppedIndexes.insert(index);
        resolver.PopPath();
    }
    return merged;
}

} // namespace ovrin_yaml
