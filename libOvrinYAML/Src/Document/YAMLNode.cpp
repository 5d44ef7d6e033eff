#include "Document/YAMLNode.h"

#include "Document/YAMLMapping.h"
#include "Document/YAMLScalar.h"
#include "Document/YAMLSequence.h"

#include <typeinfo>

namespace ovrin_yaml {

YAMLMapping& ToMapping(YAMLNode* node) {
    if (YAMLMapping* mapping = AsMapping(node)) return *mapping;
    throw std::bad_cast();
}

YAMLSequence& ToSequence(YAMLNode* node) {
    if (YAMLSequence* sequence = AsSequence(node)) return *sequence;
    throw std::bad_cast();
}

} // namespace ovrin_yaml
