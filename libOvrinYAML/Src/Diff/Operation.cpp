#include "Diff/Operation.h"

#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Diff/YAMLSequenceRemapper.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLSequence.h"

namespace ovrin_yaml {

namespace {

void FreeIfAny(YAMLNode* node) {
    if (node) node->Free();
}

void PutClone(YAMLSequence& sequence, int index, const YAMLNode* value) {
    sequence.GrowTo(static_cast<std::size_t>(index) + 1);
    FreeIfAny(sequence.Set(index, value->Clone()));
}

} // namespace

void RemoveOperation::Apply(YAMLMapping& mapping, const YAMLScalar* key) const {
    mapping.Remove(key);
}

void RemoveOperation::Apply(YAMLSequence& sequence, int index) const {
    FreeIfAny(sequence.Set(index, nullptr));
}

void ChangeOperation::Apply(YAMLMapping& mapping, const YAMLScalar* key) const {
    mapping.Change(key, m_Value->Clone())->Free();
}

void ChangeOperation::Apply(YAMLSequence& sequence, int index) const {
    PutClone(sequence, index, m_Value);
}

void AddOperation::Apply(YAMLMapping& mapping, const YAMLScalar* key) const {
    mapping.Insert(key, m_Value->Clone());
}

void AddOperation::Apply(YAMLSequence& sequence, int index) const {
    PutClone(sequence, index, m_Value);
}

void ChangeMappingOperation::Apply(YAMLMapping& mapping, const YAMLScalar* key) const {
    Change(mapping, key);
}

YAMLMapping& ChangeMappingOperation::Change(YAMLMapping& mapping, const YAMLScalar* key) const {
    mapping.GetRef(key);
    YAMLMapping& value = ToMapping(mapping.GetForChange(key));
    m_Diff->Apply(value);
    return value;
}

void ChangeMappingOperation::Apply(YAMLSequence& sequence, int index) const {
    m_Diff->Apply(ToMapping(sequence.Get(index)));
}

void ChangeSequenceOperation::Apply(YAMLMapping& mapping, const YAMLScalar* key) const {
    ApplyTo(ToSequence(mapping.GetRef(key)));
}

void ChangeSequenceOperation::Apply(YAMLSequence& sequence, int index) const {
    ApplyTo(ToSequence(sequence.Get(index)));
}

void ChangeSequenceOperation::ApplyTo(YAMLSequence& sequence) const {
    if (m_Remapper) m_Remapper->Apply(sequence);
    m_Diff->Apply(sequence);
    // A conflict that keeps the base can leave places that nothing fills. Every operation on this sequence
    // has been carried out by now, so no index that is still to come counts them.
    sequence.DropHoles();
}

} // namespace ovrin_yaml
