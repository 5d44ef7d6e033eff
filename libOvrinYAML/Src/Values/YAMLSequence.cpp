#include "Values/YAMLSequence.h"

#include "Values/Hash.h"
#include "Values/YAMLScalar.h"

#include <algorithm>
#include <cassert>
#include <utility>

namespace ovrin_yaml {

void YAMLSequence::Append(const YAMLScalar* item) {
    m_Items.push_back(item->Clone());
}

YAMLNode* YAMLSequence::Get(int index) const {
    if (index < 0 || static_cast<std::size_t>(index) >= m_Items.size())
        throw YAMLError("Cannot get non existing index in YAMLSequence");
    return m_Items[index];
}

YAMLNode* YAMLSequence::Set(int index, YAMLNode* item) {
    if (index < 0 || static_cast<std::size_t>(index) >= m_Items.size())
        throw YAMLError("Cannot change non existing index in YAMLSequence");
    return std::exchange(m_Items[index], item);
}

void YAMLSequence::GrowTo(std::size_t count) {
    if (count > kMostItems) throw YAMLError("Sequence is too long");
    if (m_Items.size() < count) m_Items.resize(count, nullptr);
}

void YAMLSequence::DropHoles() {
    std::erase(m_Items, nullptr);
}

YAMLSequence* YAMLSequence::StaticClone() const {
    YAMLSequence* clone = YAMLAlloc<YAMLSequence>::create(m_Flow);
    clone->m_Hash = m_Hash;
    clone->m_Line = m_Line;
    clone->m_Items.reserve(m_Items.size());
    for (const YAMLNode* item : m_Items) clone->m_Items.push_back(item ? item->Clone() : nullptr);
    return clone;
}

bool YAMLSequence::Equals(const YAMLNode* other) const {
    if (m_Hash && other->m_Hash) return m_Hash == other->m_Hash;
    return EqualsExpensive(other);
}

bool YAMLSequence::EqualsExpensive(const YAMLNode* other) const {
    const YAMLSequence* sequence = AsSequence(other);
    return sequence && std::equal(m_Items.begin(), m_Items.end(), sequence->m_Items.begin(),
                                  sequence->m_Items.end(), [](const YAMLNode* a, const YAMLNode* b) {
                                      return a == b || (a && b && a->EqualsExpensive(b));
                                  });
}

void YAMLSequence::RebuildHash(bool shallow) {
    std::uint32_t hash = 0;
    std::uint32_t index = 0;
    for (YAMLNode* item : m_Items) {
        assert(item);
        if (!shallow) item->RebuildHash(false);
        hash = FoldItem(hash, item->m_Hash, index++);
    }
    m_Hash = hash;
}

void YAMLSequence::ResetForAlloc() {
    for (YAMLNode* item : m_Items)
        if (item) item->Free();
    m_Items.clear();
}

} // namespace ovrin_yaml
