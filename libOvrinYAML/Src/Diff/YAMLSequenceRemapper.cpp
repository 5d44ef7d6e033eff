#include "Diff/YAMLSequenceRemapper.h"

#include <numeric>

namespace ovrin_yaml {

YAMLSequenceRemapper* YAMLSequenceRemapper::MakeIdentity(std::size_t count) {
    YAMLSequenceRemapper* identity = YAMLAlloc<YAMLSequenceRemapper>::create(count, count, true);
    std::iota(identity->m_Mapping.begin(), identity->m_Mapping.end(), 0);
    return identity;
}

bool YAMLSequenceRemapper::IsIdentity() const {
    if (m_DestinationCount != m_Mapping.size()) return false;
    for (std::size_t i = 0; i < m_Mapping.size(); ++i)
        if (m_Mapping[i] != static_cast<int>(i)) return false;
    return true;
}

NodeList YAMLSequenceRemapper::Arrange(const NodeList& items) const {
    NodeList arranged(m_DestinationCount, nullptr);
    for (std::size_t i = 0; i < m_Mapping.size(); ++i) {
        if (m_Mapping[i] == -1) continue;
        if (static_cast<std::size_t>(m_Mapping[i]) >= m_DestinationCount)
            throw YAMLError("Cannot change non existing index in YAMLSequence");
        arranged[m_Mapping[i]] = i < items.size() ? items[i] : nullptr;
    }
    return arranged;
}

void YAMLSequenceRemapper::Apply(YAMLSequence& sequence) const {
    NodeList arranged = Arrange(sequence.m_Items);
    for (std::size_t i = 0; i < sequence.m_Items.size(); ++i)
        if (Target(i) == -1 && sequence.m_Items[i]) sequence.m_Items[i]->Free();
    sequence.m_Items.swap(arranged);
    sequence.m_Hash = 0;
    sequence.m_Line = 0;
}

} // namespace ovrin_yaml
