#include "Diff/OperationComparison.h"

#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Diff/YAMLSequenceRemapper.h"

#include <algorithm>

namespace ovrin_yaml {

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
