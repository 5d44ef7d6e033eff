#include "Diff/YAMLSequenceDiff.h"

#include "Diff/ChildPairs.h"
#include "Diff/YAMLSequenceRemapper.h"

#include <algorithm>

namespace ovrin_yaml {

YAMLSequenceDiff* YAMLSequenceDiff::Diff(DiffContext& context, const NodeList& base, const NodeList& dest) {
    YAMLSequenceDiff* diff = YAMLAlloc<YAMLSequenceDiff>::create();
    ForEachChildPair(context, base, dest, [&](int index, const YAMLNode* baseItem, const YAMLNode* destItem) {
        if (const Operation* operation = CreateDiffOperation(context, baseItem, destItem))
            diff->Add(index, operation);
    });
    return diff;
}

YAMLSequenceDiff* YAMLSequenceDiff::Diff(const MergeRules& rules, const YAMLSequence* base,
                                         const YAMLSequence* dest) {
    DiffContext context(rules);
    return Diff(context, base->m_Items, dest->m_Items);
}

std::vector<YAMLSequenceDiff::Entry>::iterator YAMLSequenceDiff::LowerBound(int index) {
    return std::lower_bound(m_Entries.begin(), m_Entries.end(), index,
                            [](const Entry& entry, int wanted) { return entry.index < wanted; });
}

void YAMLSequenceDiff::Add(int index, const Operation* operation) {
    const auto position = LowerBound(index);
    if (position != m_Entries.end() && position->index == index)
        throw YAMLError("Cannot do a double change on the same key in a sequence");
    m_Entries.insert(position, {index, operation});
}

void YAMLSequenceDiff::Replace(int index, const Operation* operation) {
    const auto position = LowerBound(index);
    if (position == m_Entries.end() || position->index != index)
        throw YAMLError("Cannot replace non-existing key in a sequence");
    position->operation = operation;
}

const Operation* YAMLSequenceDiff::Find(int index) const {
    const auto position = const_cast<YAMLSequenceDiff*>(this)->LowerBound(index);
    return position != m_Entries.end() && position->index == index ? position->operation : nullptr;
}

void YAMLSequenceDiff::RemoveAndShiftMany(const std::set<int>& indexes) {
    std::vector<Entry> kept;
    auto removed = indexes.begin();
    int shift = 0;
    for (const Entry& entry : m_Entries) {
        for (; removed != indexes.end() && *removed < entry.index; ++removed) ++shift;
        if (removed != indexes.end() && *removed == entry.index) continue;
        kept.push_back({entry.index - shift, entry.operation});
    }
    m_Entries.swap(kept);
}

YAMLSequenceDiff* YAMLSequenceDiff::Remap(const YAMLSequenceRemapper* remapper) const {
    YAMLSequenceDiff* remapped = YAMLAlloc<YAMLSequenceDiff>::create();
    for (const Entry& entry : m_Entries) {
        const int target = remapper->Target(entry.index);
        if (target != -1) remapped->m_Entries.push_back({target, entry.operation});
    }
    auto& entries = remapped->m_Entries;
    std::stable_sort(entries.begin(), entries.end(),
                     [](const Entry& a, const Entry& b) { return a.index < b.index; });
    // Of a run with one index, the last entry is kept: walk from the back.
    const auto kept = std::unique(entries.rbegin(), entries.rend(),
                                  [](const Entry& a, const Entry& b) { return a.index == b.index; });
    entries.erase(entries.begin(), kept.base());
    return remapped;
}

void YAMLSequenceDiff::Apply(YAMLSequence& target) const {
    for (const Entry& entry : m_Entries) entry.operation->Apply(target, entry.index);
}

} // namespace ovrin_yaml
