// The text of diffs: the Output methods of the operations and of the two kinds of diff.

#include "Diff/Operation.h"
#include "Diff/YAMLDiffOutput.h"
#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Diff/YAMLSequenceRemapper.h"
#include "Values/YAMLMapping.h"
#include "Writing/ObjectFileWriter.h"
#include "Writing/YAMLEmitter.h"

namespace ovrin_yaml {

namespace {

/// An object is shown without its header data.
std::string TextOf(const YAMLNode* value) {
    const YAMLMapping* mapping = AsMapping(value);
    if (!mapping || !mapping->HasKey(YAMLScalar::classIDPlaceHolderName)) return GetYAMLString(*value);
    std::string text;
    AppendObjectBody(*mapping, text);
    return text;
}

void MoveLine(YAMLDiffOutput& output, std::size_t from, int to) {
    output << "move index \"" << from << "\" to \"" << static_cast<std::size_t>(to) << "\"" << endl;
}

/// The position counts base elements less the removals printed so far, and is compared with destination
/// indexes as it stands.
void OutputMoves(YAMLDiffOutput& output, const YAMLSequenceRemapper& remapper, const YAMLSequenceDiff& diff) {
    output.Indent();
    std::size_t position = 0;
    for (const int target : remapper.m_Mapping) {
        if (target == -1 && !diff.Find(static_cast<int>(position))) {
            output << "delete index \"" << position << "\"" << endl;
            continue;
        }
        if (target != -1 && target != static_cast<int>(position)) MoveLine(output, position, target);
        ++position;
    }
    output.Unindent();
}

} // namespace

void RemoveOperation::Output(YAMLDiffOutput& output) const {
    output << "delete" << endl;
}

void ChangeOperation::Output(YAMLDiffOutput& output) const {
    output << "change to " << GetYAMLString(*m_Value) << endl;
}

void AddOperation::Output(YAMLDiffOutput& output) const {
    output << "add as ";
    const std::string text = TextOf(m_Value);
    if (text.find('\n') == std::string::npos)
        output << text;
    else
        output.WriteAligned(text);
    output << endl;
}

void ChangeMappingOperation::Output(YAMLDiffOutput& output) const {
    output << endl;
    output.Indent();
    m_Diff->Output(output);
    output.Unindent();
}

void ChangeSequenceOperation::Output(YAMLDiffOutput& output) const {
    output << "[";
    if (m_Remapper) output << m_Remapper->m_Mapping.size();
    output << "]" << endl;
    if (m_Remapper) OutputMoves(output, *m_Remapper, *m_Diff);
    m_Diff->Output(output);
}

void YAMLMappingDiff::Output(YAMLDiffOutput& output) const {
    if (m_Entries.empty()) return;
    output.Indent();
    for (const Entry& entry : m_Entries) {
        output << entry.key->Value() << " ";
        entry.operation->Output(output);
    }
    output.Unindent();
}

void YAMLSequenceDiff::Output(YAMLDiffOutput& output) const {
    if (m_Entries.empty()) return;
    output.Indent();
    for (const Entry& entry : m_Entries) {
        output << "index " << static_cast<std::size_t>(entry.index) << " ";
        entry.operation->Output(output);
    }
    output.Unindent();
}

} // namespace ovrin_yaml
