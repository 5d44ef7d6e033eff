#include "Diff/YAMLMappingDiff.h"

#include "Diff/ChildPairs.h"
#include "Diff/KeyOrder.h"

#include <algorithm>

namespace ovrin_yaml {

YAMLMappingDiff* YAMLMappingDiff::Diff(DiffContext& context, const YAMLMapping* base,
                                       const YAMLMapping* dest) {
    YAMLMappingDiff* diff = YAMLAlloc<YAMLMappingDiff>::create();
    ForEachChildPair(context, base, dest,
                     [&](const YAMLScalar* key, const YAMLNode* baseValue, const YAMLNode* destValue) {
                         if (const Operation* operation = CreateDiffOperation(context, baseValue, destValue))
                             diff->Add(key, operation);
                     });
    diff->m_KeyOrder = DiffKeyOrder(context.rules, base, dest);
    return diff;
}

YAMLMappingDiff* YAMLMappingDiff::Diff(const MergeRules& rules, const YAMLMapping* base,
                                       const YAMLMapping* dest) {
    DiffContext context(rules);
    return Diff(context, base, dest);
}

void YAMLMappingDiff::Add(const YAMLScalar* key, const Operation* operation) {
    if (HasKey(key)) throw YAMLError("Cannot do a double change on the same key in a mapping");
    m_Entries.push_back({key, operation});
    if (m_Index) {
        m_Index->Set(key, static_cast<std::uint32_t>(m_Entries.size() - 1));
    } else if (m_Entries.size() > KeyIndex::kSearchLimit) {
        m_Index = std::make_unique<KeyIndex>();
        for (std::uint32_t i = 0; i < m_Entries.size(); ++i) m_Index->Set(m_Entries[i].key, i);
    }
}

const Operation* YAMLMappingDiff::Find(const YAMLScalar* key) const {
    if (m_Index) {
        const std::uint32_t position = m_Index->Find(key);
        return position == KeyIndex::kMissing ? nullptr : m_Entries[position].operation;
    }
    for (const Entry& entry : m_Entries)
        if (entry.key == key) return entry.operation;
    return nullptr;
}

bool YAMLMappingDiff::LeavesKeys() const {
    const auto changesInPlace = [](const Entry& entry) {
        const Operation::Kind kind = entry.operation->GetKind();
        return kind != Operation::Kind::Add && kind != Operation::Kind::Remove;
    };
    return (!m_KeyOrder || IsIdentityKeyOrder(m_KeyOrder)) &&
           std::all_of(m_Entries.begin(), m_Entries.end(), changesInPlace);
}

void YAMLMappingDiff::Apply(YAMLMapping& target) const {
    if (LeavesKeys()) {
        target.RequireNormalState();
        for (const Entry& entry : m_Entries) entry.operation->Apply(target, entry.key);
        return;
    }
    std::vector<const YAMLScalar*> before;
    before.reserve(target.Size());
    for (const auto& entry : target) before.push_back(entry.key);
    for (const Entry& entry : m_Entries) entry.operation->Apply(target, entry.key);
    if (m_KeyOrder) ApplyKeyOrder(m_KeyOrder, before, target);
}

} // namespace ovrin_yaml
