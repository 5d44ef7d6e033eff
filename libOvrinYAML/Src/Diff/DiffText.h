#pragma once

namespace ovrin_yaml {

class Operation;
class YAMLDiffOutput;
class YAMLMappingDiff;

/// Prints each key and its operation, one step further in than what stands around it:
///
///     m_Name change to Hero
///     m_Children [3]                base elements, where any of them moved or went
///         delete index "0"          what became of them, counted without those that are gone already
///         move index "1" to "0"
///         index 2 add as {fileID: 7}
void OutputDiff(const YAMLMappingDiff& diff, YAMLDiffOutput& output);

/// Prints the operation and ends the line that the caller began.
void OutputOperation(const Operation& operation, YAMLDiffOutput& output);

} // namespace ovrin_yaml
