#include "Diff/MergeTreeCloneVisitor.h"

#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Diff/YAMLSequenceRemapper.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLSequence.h"

namespace ovrin_yaml {

namespace {

/// Replaces every scalar value below a container by the empty text.
class YAMLNodeClearVisitor final : public YAMLNodeVisitor {
public:
    void Visit(const YAMLScalar&) override {}
    void Visit(YAMLMapping& mapping) override;
    void Visit(YAMLSequence& sequence) override;
};

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

} // namespace

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

} // namespace ovrin_yaml
