#include "Document/YAMLNode.h"

#include "Document/YAMLMapping.h"
#include "Document/YAMLScalar.h"
#include "Document/YAMLSequence.h"

#include <typeinfo>

namespace ovrin_yaml {

namespace {

template <class Target, YAMLNode::Kind kind, class Node> Target* As(Node* node) {
    return node && node->GetKind() == kind ? static_cast<Target*>(node) : nullptr;
}

} // namespace

YAMLScalar* AsScalar(YAMLNode* node) {
    return As<YAMLScalar, YAMLNode::Kind::Scalar>(node);
}
YAMLMapping* AsMapping(YAMLNode* node) {
    return As<YAMLMapping, YAMLNode::Kind::Mapping>(node);
}
YAMLSequence* AsSequence(YAMLNode* node) {
    return As<YAMLSequence, YAMLNode::Kind::Sequence>(node);
}
const YAMLScalar* AsScalar(const YAMLNode* node) {
    return As<const YAMLScalar, YAMLNode::Kind::Scalar>(node);
}
const YAMLMapping* AsMapping(const YAMLNode* node) {
    return As<const YAMLMapping, YAMLNode::Kind::Mapping>(node);
}
const YAMLSequence* AsSequence(const YAMLNode* node) {
    return As<const YAMLSequence, YAMLNode::Kind::Sequence>(node);
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
