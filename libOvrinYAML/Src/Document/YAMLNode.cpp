#include "Document/YAMLNode.h"

#include "Document/YAMLMapping.h"
#include "Document/YAMLScalar.h"
#include "Document/YAMLSequence.h"

#include <typeinfo>

namespace ovrin_yaml {

YAMLNode* CopyExactly(const YAMLNode* node) {
    if (const YAMLMapping* mapping = AsMapping(node)) {
        YAMLMapping* copy = YAMLAlloc<YAMLMapping>::create(mapping->m_Flow);
        copy->Reserve(mapping->RawEntries().size());
        for (const auto& [key, value] : mapping->RawEntries())
            if (key) copy->Append(key, CopyExactly(value));
        copy->m_Hash = mapping->m_Hash;
        copy->m_Line = mapping->m_Line;
        return copy;
    }
    if (const YAMLSequence* sequence = AsSequence(node)) {
        YAMLSequence* copy = YAMLAlloc<YAMLSequence>::create(sequence->m_Flow);
        copy->m_Items.reserve(sequence->m_Items.size());
        for (const YAMLNode* item : sequence->m_Items)
            copy->m_Items.push_back(item ? CopyExactly(item) : nullptr);
        copy->m_Hash = sequence->m_Hash;
        copy->m_Line = sequence->m_Line;
        return copy;
    }
    return node->Clone();
}

YAMLMapping& ToMapping(YAMLNode* node) {
    if (YAMLMapping* mapping = AsMapping(node)) return *mapping;
    throw std::bad_cast();
}

YAMLSequence& ToSequence(YAMLNode* node) {
    if (YAMLSequence* sequence = AsSequence(node)) return *sequence;
    throw std::bad_cast();
}

} // namespace ovrin_yaml
