#pragma once

#include "Values/YAMLMapping.h"

namespace ovrin_yaml {

/// Looks up the keys of one mapping in another. Most mappings that are compared have the same keys in the
/// same order, so the pair behind the one found last is tried before any search. The mapping must not change
/// meanwhile.
class AlignedLookup {
public:
    explicit AlignedLookup(const YAMLMapping& mapping)
        : m_Mapping(mapping), m_Next(mapping.begin()), m_End(mapping.end()) {}

    /// The value of `key`, or null.
    const YAMLNode* Get(const YAMLScalar* key) {
        if (m_Next == m_End || m_Next->key != key) {
            const YAMLMapping::Iterator found = m_Mapping.FindKey(key);
            if (found == m_End) return nullptr;
            m_Next = found;
        }
        const YAMLNode* value = m_Next->value;
        ++m_Next;
        return value;
    }

private:
    const YAMLMapping& m_Mapping;
    YAMLMapping::Iterator m_Next;
    const YAMLMapping::Iterator m_End;
};

} // namespace ovrin_yaml
