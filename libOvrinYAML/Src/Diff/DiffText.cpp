#include "Diff/DiffText.h"

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

void OutputAddition(const AddOperation& add, YAMLDiffOutput& output) {
    output << "add as ";
    const std::string text = TextOf(add.m_Value);
    if (text.find('\n') == std::string::npos)
        output << text;
    else
        output.WriteAligned(text);
    output << endl;
}

void OutputMappingChange(const ChangeMappingOperation& change, YAMLDiffOutput& output) {
    output << endl;
    output.Indent();
    OutputDiff(*change.m_Diff, output);
    output.Unindent();
}

void OutputEntries(const YAMLSequenceDiff& diff, YAMLDiffOutput& output) {
    if (diff.Entries().empty()) return;
    output.Indent();
    for (const auto& [index, operation] : diff.Entries()) {
        output << "index " << static_cast<std::size_t>(index) << " ";
        OutputOperation(*operation, output);
    }
    output.Unindent();
}

void OutputSequenceChange(const ChangeSequenceOperation& change, YAMLDiffOutput& output) {
    output << "[";
    if (change.m_Remapper) output << change.m_Remapper->m_Mapping.size();
    output << "]" << endl;
    if (change.m_Remapper) OutputMoves(output, *change.m_Remapper, *change.m_Diff);
    OutputEntries(*change.m_Diff, output);
}

} // namespace

void OutputDiff(const YAMLMappingDiff& diff, YAMLDiffOutput& output) {
    if (diff.Entries().empty()) return;
    output.Indent();
    for (const auto& [key, operation] : diff.Entries()) {
        output << key->Value() << " ";
        OutputOperation(*operation, output);
    }
    output.Unindent();
}

void OutputOperation(const Operation& operation, YAMLDiffOutput& output) {
    switch (operation.GetKind()) {
    case Operation::Kind::Remove:
        output << "delete" << endl;
        break;
    case Operation::Kind::Change:
        output << "change to " << GetYAMLString(*As<ChangeOperation>(&operation)->m_Value) << endl;
        break;
    case Operation::Kind::Add:
        return OutputAddition(*As<AddOperation>(&operation), output);
    case Operation::Kind::ChangeMapping:
        return OutputMappingChange(*As<ChangeMappingOperation>(&operation), output);
    case Operation::Kind::ChangeSequence:
        return OutputSequenceChange(*As<ChangeSequenceOperation>(&operation), output);
    }
}

} // namespace ovrin_yaml
