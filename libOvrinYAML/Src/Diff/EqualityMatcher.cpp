#include "Diff/EqualityMatcher.h"

#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"

#include <algorithm>
#include <cstdint>
#include <numeric>

namespace ovrin_yaml {

namespace {

constexpr std::size_t kNone = SIZE_MAX;

bool IsOdd(const YAMLNode* node) {
    if (const YAMLMapping* mapping = AsMapping(node))
        return mapping->HasDuplicates() || (!mapping->m_Hash && mapping->Size());
    const YAMLSequence* sequence = AsSequence(node);
    return sequence && !sequence->m_Hash && !sequence->m_Items.empty();
}

} // namespace

EqualityMatcher::EqualityMatcher(const NodeList& items, std::size_t begin, std::size_t end)
    : m_Items(items), m_Begin(begin), m_Taken(end - begin, false), m_All(end - begin) {
    std::iota(m_All.begin(), m_All.end(), static_cast<std::uint32_t>(begin));
    for (const std::uint32_t position : m_All)
        if (IsOdd(items[position])) m_Odd.push_back(position);
}

int EqualityMatcher::TakeFirstEqual(const YAMLNode* element) {
    std::size_t found = kNone;
    if (AsScalar(element)) {
        FillOnce(m_ScalarBuckets, [](const YAMLNode* item) { return item; });
        found = FirstIn(m_ScalarBuckets, element, element);
    } else if (IsOdd(element)) {
        found = FirstAmong(m_All, element);
    } else {
        FillOnce(m_HashBuckets, [](const YAMLNode* item) { return item->m_Hash; });
        found = std::min(FirstIn(m_HashBuckets, element->m_Hash, element), FirstAmong(m_Odd, element));
    }
    if (found == kNone) return -1;
    m_Taken[found - m_Begin] = true;
    return static_cast<int>(found);
}

template <class Buckets, class KeyOf>
void EqualityMatcher::FillOnce(Buckets& buckets, const KeyOf& keyOf) const {
    if (!buckets.empty()) return;
    buckets.reserve(m_All.size());
    for (const std::uint32_t position : m_All)
        buckets[keyOf(m_Items[position])].positions.push_back(position);
}

template <class Buckets, class Key>
std::size_t EqualityMatcher::FirstIn(Buckets& buckets, const Key& key, const YAMLNode* element) const {
    const auto found = buckets.find(key);
    if (found == buckets.end()) return kNone;
    Bucket& bucket = found->second;
    const auto& positions = bucket.positions;
    while (bucket.firstFree < positions.size() && m_Taken[positions[bucket.firstFree] - m_Begin])
        ++bucket.firstFree;
    for (std::size_t i = bucket.firstFree; i < positions.size(); ++i)
        if (IsFreeAndEqual(positions[i], element)) return positions[i];
    return kNone;
}

std::size_t EqualityMatcher::FirstAmong(const std::vector<std::uint32_t>& positions,
                                        const YAMLNode* element) const {
    for (const std::uint32_t position : positions)
        if (IsFreeAndEqual(position, element)) return position;
    return kNone;
}

bool EqualityMatcher::IsFreeAndEqual(std::size_t position, const YAMLNode* element) const {
    return !m_Taken[position - m_Begin] && element->Equals(m_Items[position]);
}

} // namespace ovrin_yaml
