#include "Merge/YAMLConflict.h"

#include "Merge/OperationMerge.h"
#include "Values/YAMLError.h"

namespace ovrin_yaml {

void ConflictResolver::PushPath(const YAMLScalar* key) {
    const Path& path = m_Path.Elements();
    if (key == YAMLScalar::mFather && !path.empty() &&
        (path.back() == YAMLScalar::transform || path.back() == YAMLScalar::rectTransform)) {
        if (m_IsChangedTransform.insert(path.front()).second) m_ChangedTransforms.push_back(path.front());
    }
    m_Path.Push(key);
}

void ConflictResolver::PopPath() {
    if (m_Path.Elements().empty()) throw YAMLError("Tried to pop on empty ConflictResolver path");
    m_Path.Pop();
}

SidePickingConflictResolver::SidePickingConflictResolver(const MergeRules& rules, MergeResolve side)
    : ConflictResolver(rules), m_Side(side) {
    if (side != ResolveLeft && side != ResolveRight)
        throw YAMLError("SidePickingConflictResolver only accepts side left or right");
}

const Operation* SidePickingConflictResolver::Pick(const Operation* left, const Operation* right) const {
    return m_Side == ResolveLeft ? left : right;
}

const Operation* SidePickingConflictResolver::OnSameValueAdded(const AddOperation* left,
                                                               const AddOperation* right) {
    return Pick(left, right);
}

const Operation* SidePickingConflictResolver::OnSameValueChanged(const ChangeOperation* left,
                                                                 const ChangeOperation* right) {
    return Pick(left, right);
}

const Operation* SidePickingConflictResolver::OnSameValueChanged(const RemoveOperation* left,
                                                                 const ChangeOperation* right) {
    return Pick(left, right);
}

const Operation* SidePickingConflictResolver::OnSameValueChanged(const RemoveOperation* left,
                                                                 const ChangeMappingOperation* right) {
    return Pick(left, right);
}

const Operation* SidePickingConflictResolver::OnSameMappingChanged(const ChangeMappingOperation* left,
                                                                   const ChangeMappingOperation* right) {
    return MergeMappingChanges(left, right, *this);
}

const Operation* SidePickingConflictResolver::OnSameSequenceChanged(const ChangeSequenceOperation* left,
                                                                    const ChangeSequenceOperation* right) {
    return Pick(left, right);
}

void SidePickingConflictResolver::OnComponentDependencyConflict(const ComponentDependencyConflict&) {
    throw YAMLError("OnComponentDependencyConflict not implemented in SidePickingConflictResolver");
}

const Operation* ExceptionConflictResolver::OnSameValueAdded(const AddOperation* left, const AddOperation*) {
    throw YAMLError("Conflict for same value added " + PathToString(m_Path.Elements()) + " at line " +
                    std::to_string(left->m_Value->m_Line));
}

const Operation* ExceptionConflictResolver::OnSameValueChanged(const ChangeOperation*,
                                                               const ChangeOperation*) {
    throw YAMLError("Conflict for same value changed " + PathToString(m_Path.Elements()));
}

const Operation* ExceptionConflictResolver::OnSameValueChanged(const RemoveOperation*,
                                                               const ChangeOperation*) {
    throw YAMLError("Conflict for removed value changed " + PathToString(m_Path.Elements()));
}

const Operation* ExceptionConflictResolver::OnSameValueChanged(const RemoveOperation*,
                                                               const ChangeMappingOperation*) {
    throw YAMLError("Conflict for removed value changed " + PathToString(m_Path.Elements()) +
                    " in right file");
}

const Operation* ExceptionConflictResolver::OnSameMappingChanged(const ChangeMappingOperation*,
                                                                 const ChangeMappingOperation*) {
    throw YAMLError("Conflict for same mapping changed " + PathToString(m_Path.Elements()));
}

const Operation* ExceptionConflictResolver::OnSameSequenceChanged(const ChangeSequenceOperation*,
                                                                  const ChangeSequenceOperation*) {
    throw YAMLError("Conflict for same sequence changed " + PathToString(m_Path.Elements()));
}

void ExceptionConflictResolver::OnComponentDependencyConflict(const ComponentDependencyConflict&) {
    throw YAMLError("OnComponentDependencyConflict not implemented in ExceptionConflictResolver");
}

} // namespace ovrin_yaml
