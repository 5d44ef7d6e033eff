#include "Diff/DifferenceCheck.h"

#include "Diff/ChildPairs.h"
#include "Diff/SequenceMatching.h"

#include <functional>

namespace ovrin_yaml {

DifferenceCheck::DifferenceCheck(const MergeRules& rules)
    : m_Context(rules), m_LongestRule(rules.LongestPath()) {}

std::size_t DifferenceCheck::PairHash::operator()(const Pair& pair) const {
    const std::hash<const YAMLNode*> hash;
    return hash(pair.first) * 31 + hash(pair.second);
}

bool DifferenceCheck::Differ(const YAMLMapping* base, const YAMLMapping* dest) {
    return ChildrenDiffer(base, dest);
}

bool DifferenceCheck::Differ(const YAMLSequence* base, const YAMLSequence* dest) {
    return ChildrenDiffer(base->m_Items, dest->m_Items);
}

/// Goes on behind the first difference, where a repeated key may be.
template <class Container>
bool DifferenceCheck::ChildrenDiffer(const Container& base, const Container& dest) {
    bool differ = false;
    ForEachChildPair(m_Context, base, dest,
                     [&](const auto&, const YAMLNode* baseChild, const YAMLNode* destChild) {
                         if (DifferAtPath(baseChild, destChild)) differ = true;
                     });
    return differ;
}

bool DifferenceCheck::DifferAtPath(const YAMLNode* base, const YAMLNode* dest) {
    if (!base || !dest) {
        LetRulesLook(base ? base : dest);
        return true;
    }
    if (base->GetKind() != dest->GetKind()) return true;
    if (const YAMLScalar* scalar = AsScalar(base)) return ScalarsDiffer(m_Context, scalar, AsScalar(dest));
    if (m_Context.path.size() <= m_LongestRule) return ContainersDiffer(base, dest);
    const auto known = m_Known.find({base, dest});
    if (known != m_Known.end()) return known->second;
    const bool differ = ContainersDiffer(base, dest);
    m_Known.emplace(Pair{base, dest}, differ);
    return differ;
}

bool DifferenceCheck::ContainersDiffer(const YAMLNode* base, const YAMLNode* dest) {
    if (const YAMLMapping* mapping = AsMapping(base)) {
        const bool differ = Differ(mapping, AsMapping(dest));
        if (differ) LetRulesLook(dest);
        return differ;
    }
    const YAMLSequence *baseList = AsSequence(base), *destList = AsSequence(dest);
    YAMLSequenceRemapper* remapper = FindMapping(m_Context, baseList, destList);
    const bool childrenDiffer = remapper
                                    ? ChildrenDiffer(remapper->Arrange(baseList->m_Items), destList->m_Items)
                                    : Differ(baseList, destList);
    const bool differ = remapper || childrenDiffer;
    YAMLAlloc<YAMLSequenceRemapper>::free(remapper);
    if (differ) LetRulesLook(dest);
    return differ;
}

void DifferenceCheck::LetRulesLook(const YAMLNode* node) const {
    m_Context.rules.IsMergeablePath(m_Context.path, node);
}

} // namespace ovrin_yaml
