#pragma once

#include "Diff/Operation.h"

namespace ovrin_yaml {

/// Deep copies of operation trees. A copy shares no value, diff or remapper with its source.
class MergeTreeCloneVisitor {
public:
    static Operation* Clone(const Operation* operation);
    /// The same with every scalar value replaced by the empty text: keys, lengths, structure and key order
    /// stay.
    static Operation* CloneBlank(const Operation* operation);

private:
    explicit MergeTreeCloneVisitor(bool blank) : m_Blank(blank) {}

    Operation* Visit(const Operation* operation) const;
    YAMLMappingDiff* Visit(const YAMLMappingDiff* diff) const;
    YAMLSequenceDiff* Visit(const YAMLSequenceDiff* diff) const;
    YAMLNode* CopyValue(const YAMLNode* value) const;

    const bool m_Blank;
};

} // namespace ovrin_yaml
