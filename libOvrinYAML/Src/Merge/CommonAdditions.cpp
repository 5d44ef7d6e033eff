#include "Merge/CommonAdditions.h"

#include "Diff/SequenceMatching.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Diff/YAMLSequenceRemapper.h"

namespace ovrin_yaml {

namespace {

/// The additions of one side's diff, as a list of their values.
struct Additions {
    explicit Additions(const YAMLSequenceDiff& diff) {
        for (const auto& entry : diff.Entries()) {
            const auto* add = As<AddOperation>(entry.operation);
            if (!add) continue;
            operations.push_back(add);
            indexes.push_back(entry.index);
            values.m_Items.push_back(const_cast<YAMLNode*>(add->m_Value));
        }
    }

    std::vector<const AddOperation*> operations;
    std::vector<int> indexes; // in the numbering of the side
    YAMLSequence values;      // only looked at; the nodes belong to the operations' trees
};

} // namespace

std::vector<CommonAddition> FindCommonAdditions(const YAMLSequenceDiff& left, const YAMLSequenceDiff& right,
                                                const std::vector<Path>& keyPaths) {
    const Additions leftAdded(left), rightAdded(right);
    YAMLSequenceRemapper* matches = FindIdMapping(keyPaths, &leftAdded.values, &rightAdded.values);
    std::vector<CommonAddition> common;
    for (std::size_t i = 0; i < matches->m_Mapping.size(); ++i) {
        if (matches->m_Mapping[i] == -1) continue;
        const auto j = static_cast<std::size_t>(matches->m_Mapping[i]);
        common.push_back(
            {leftAdded.indexes[i], rightAdded.indexes[j], leftAdded.operations[i], rightAdded.operations[j]});
    }
    YAMLAlloc<YAMLSequenceRemapper>::free(matches);
    return common;
}

} // namespace ovrin_yaml
