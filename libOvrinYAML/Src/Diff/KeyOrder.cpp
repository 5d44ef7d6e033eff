#include "Diff/KeyOrder.h"

#include "Diff/DiffContext.h"
#include "Diff/SequenceMatching.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLSequence.h"

#include <algorithm>

namespace ovrin_yaml {

namespace {

YAMLSequence* KeysOf(const YAMLMapping* mapping) {
    YAMLSequence* keys = YAMLAlloc<YAMLSequence>::create();
    keys->m_Items.reserve(mapping->Size());
    for (const auto& entry : *mapping) keys->Append(entry.key);
    return keys;
}

bool HaveSameKeys(const YAMLMapping* base, const YAMLMapping* dest) {
    return base->Size() == dest->Size() &&
           std::equal(base->begin(), base->end(), dest->begin(),
                      [](const auto& a, const auto& b) { return a.key == b.key; });
}

const ChangeSequenceOperation* MakeIdentity(std::size_t count) {
    YAMLSequenceDiff* noChange = YAMLAlloc<YAMLSequenceDiff>::create();
    return YAMLAlloc<ChangeSequenceOperation>::create(noChange, YAMLSequenceRemapper::MakeIdentity(count),
                                                      true);
}

/// Nearly all mappings keep their keys: operations never change, so one identity of each length serves them
/// all.
const ChangeSequenceOperation* Identity(std::size_t count) {
    constexpr std::size_t kKeptLengths = 64;
    if (count >= kKeptLengths) return MakeIdentity(count);
    thread_local const ChangeSequenceOperation* t_Identities[kKeptLengths] = {};
    if (!t_Identities[count]) t_Identities[count] = MakeIdentity(count);
    return t_Identities[count];
}

} // namespace

const ChangeSequenceOperation* DiffKeyOrder(const MergeRules& rules, const YAMLMapping* base,
                                            const YAMLMapping* dest) {
    if (HaveSameKeys(base, dest)) return Identity(base->Size());
    DiffContext context(rules, {YAMLScalar::underscore});
    YAMLSequence* baseKeys = KeysOf(base);
    YAMLSequence* destKeys = KeysOf(dest);
    // Never null: the lists differ. They are told apart by their keys, for lists of one hash need not be
    // equal.
    const YAMLSequenceRemapper* remapper = FindKeyListMapping(baseKeys, destKeys, *dest);
    const YAMLSequenceDiff* diff =
        YAMLSequenceDiff::Diff(context, remapper->Arrange(baseKeys->m_Items), destKeys->m_Items);
    const bool mergeable = rules.IsMergeablePath(context.path, destKeys);
    // The operations inside point at the keys, which outlive their lists.
    YAMLAlloc<YAMLSequence>::free(baseKeys);
    YAMLAlloc<YAMLSequence>::free(destKeys);
    return YAMLAlloc<ChangeSequenceOperation>::create(diff, remapper, mergeable);
}

bool IsIdentityKeyOrder(const ChangeSequenceOperation* order) {
    return order->m_Diff->Entries().empty() && (!order->m_Remapper || order->m_Remapper->IsIdentity());
}

void ApplyKeyOrder(const ChangeSequenceOperation* order, const std::vector<const YAMLScalar*>& before,
                   YAMLMapping& target) {
    YAMLSequence keys;
    keys.m_Items.reserve(before.size());
    for (const YAMLScalar* key : before) keys.Append(key);
    if (order->m_Remapper && !order->m_Remapper->IsIdentity()) order->m_Remapper->Apply(keys);
    order->m_Diff->Apply(keys);
    std::vector<const YAMLScalar*> after;
    after.reserve(keys.m_Items.size());
    for (const YAMLNode* key : keys.m_Items)
        if (key) after.push_back(AsScalar(key));
    target.Reorder(after);
}

} // namespace ovrin_yaml
