#include "Diff/MergeTreeVisitors.h"

#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Diff/YAMLSequenceRemapper.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLSequence.h"

#include <algorithm>

namespace ovrin_yaml {

Operation* MergeTreeCloneVisitor::Clone(const Operation* operation) {
    return MergeTreeCloneVisitor(false).Visit(operation);
}

Operation* MergeTreeCloneVisitor::CloneBlank(const Operation* operation) {
    return MergeTreeCloneVisitor(true).Visit(operation);
}

Operation* MergeTreeCloneVisitor::Visit(const Operation* operation) const {
    const bool mergeable = operation->m_Mergeable;
    if (As<RemoveOperation>(operation)) return YAMLAlloc<RemoveOperation>::create(mergeable);
    if (const auto* change = As<ChangeOperation>(operation))
        return YAMLAlloc<ChangeOperation>::create(CopyValue(change->m_Value));
    if (const auto* add = As<AddOperation>(operation))
        return YAMLAlloc<AddOperation>::create(CopyValue(add->m_Value), mergeable);
    if (const auto* mapping = As<ChangeMappingOperation>(operation))
        return YAMLAlloc<ChangeMappingOperation>::create(Visit(mapping->m_Diff), mergeable);
    const auto* sequence = As<ChangeSequenceOperation>(operation);
    const YAMLSequenceRemapper* remapper =
        sequence->m_Remapper ? YAMLAlloc<YAMLSequenceRemapper>::create(*sequence->m_Remapper) : nullptr;
    return YAMLAlloc<ChangeSequenceOperation>::create(Visit(sequence->m_Diff), remapper, mergeable);
}

YAMLMappingDiff* MergeTreeCloneVisitor::Visit(const YAMLMappingDiff* diff) const {
    YAMLMappingDiff* copy = YAMLAlloc<YAMLMappingDiff>::create();
    for (const auto& entry : diff->Entries()) copy->Add(entry.key, Visit(entry.operation));
    if (diff->m_KeyOrder) copy->m_KeyOrder = As<ChangeSequenceOperation>(Clone(diff->m_KeyOrder));
    return copy;
}

YAMLSequenceDiff* MergeTreeCloneVisitor::Visit(const YAMLSequenceDiff* diff) const {
    YAMLSequenceDiff* copy = YAMLAlloc<YAMLSequenceDiff>::create();
    for (const auto& entry : diff->Entries()) copy->Add(entry.index, Visit(entry.operation));
    return copy;
}

YAMLNode* MergeTreeCloneVisitor::CopyValue(const YAMLNode* value) const {
    if (m_Blank && AsScalar(value)) return YAMLScalar::empty;
    YAMLNode* copy = value->Clone();
    YAMLNodeClearVisitor blanker;
    if (m_Blank) copy->Accept(blanker);
    return copy;
}

void YAMLNodeClearVisitor::Visit(YAMLMapping& mapping) {
    for (const auto& [key, value] : mapping) {
        if (AsScalar(value))
            mapping.Change(key, YAMLScalar::empty);
        else
            value->Accept(*this);
    }
}

void YAMLNodeClearVisitor::Visit(YAMLSequence& sequence) {
    for (YAMLNode*& item : sequence.m_Items) {
        if (AsScalar(item))
            item = YAMLScalar::empty;
        else
            item->Accept(*this);
    }
}

namespace {

bool Equal(const YAMLSequenceRemapper* first, const YAMLSequenceRemapper* second) {
    if (!first || !second) return first == second;
    return first->m_IsSet == second->m_IsSet && first->m_DestinationCount == second->m_DestinationCount &&
           first->m_Mapping == second->m_Mapping;
}

} // namespace

bool OperationComparison::ListChangesAreEqual(const ChangeSequenceOperation* first,
                                              const ChangeSequenceOperation* second) {
    if (!first || !second) return first == second;
    if (m_Unequal.contains({first, second})) return false;
    const auto& a = first->m_Diff->Entries();
    const auto& b = second->m_Diff->Entries();
    const bool areEqual = std::equal(a.begin(), a.end(), b.begin(), b.end(),
                                     [this](const auto& x, const auto& y) {
                                         return x.index == y.index && AreEqual(x.operation, y.operation);
                                     }) &&
                          Equal(first->m_Remapper, second->m_Remapper);
    if (!areEqual) m_Unequal.insert({first, second});
    return areEqual;
}

bool OperationComparison::DiffsAreEqual(const YAMLMappingDiff* first, const YAMLMappingDiff* second) {
    const auto& a = first->Entries();
    const auto& b = second->Entries();
    return std::equal(a.begin(), a.end(), b.begin(), b.end(),
                      [this](const auto& x, const auto& y) {
                          return x.key == y.key && AreEqual(x.operation, y.operation);
                      }) &&
           ListChangesAreEqual(first->m_KeyOrder, second->m_KeyOrder);
}

bool OperationComparison::AreEqual(const Operation* first, const Operation* second) {
    if (first == second) return true;
    if (first->GetKind() != second->GetKind()) return false;
    switch (first->GetKind()) {
    case Operation::Kind::Remove:
        return true;
    case Operation::Kind::Change:
    case Operation::Kind::Add:
        return static_cast<const ValuedOperation*>(second)->m_Value->Equals(
            static_cast<const ValuedOperation*>(first)->m_Value);
    case Operation::Kind::ChangeMapping:
        return DiffsAreEqual(As<ChangeMappingOperation>(first)->m_Diff,
                             As<ChangeMappingOperation>(second)->m_Diff);
    case Operation::Kind::ChangeSequence:
        return ListChangesAreEqual(As<ChangeSequenceOperation>(first), As<ChangeSequenceOperation>(second));
    }
    return false;
}

bool OperationEquals(const Operation* first, const Operation* second) {
    return OperationComparison().AreEqual(first, second);
}

} // namespace ovrin_yaml
