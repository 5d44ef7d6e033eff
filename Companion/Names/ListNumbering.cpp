#include "Names/ListNumbering.h"

#include "Diff/YAMLSequenceRemapper.h"
#include "Merge/CommonAdditions.h"
#include "Merge/RemapperMerge.h"

#include <set>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

const YAMLSequenceRemapper* RemapperOf(const ChangeSequenceOperation* change) {
    return change && change->m_Remapper && !change->m_Remapper->m_Mapping.empty() ? change->m_Remapper
                                                                                  : nullptr;
}

} // namespace

ListNumbering::ListNumbering(const ChangeSequenceOperation* theirs, const ChangeSequenceOperation* ours,
                             const ListRule& rule) {
    if (theirs && ours && theirs->m_Remapper && ours->m_Remapper)
        NumberByBoth(*theirs, *ours, rule);
    else if (const YAMLSequenceRemapper* remapper = RemapperOf(theirs))
        NumberByOne(*remapper, &Indexes::theirs, &Indexes::ours);
    else if (const YAMLSequenceRemapper* remapper = RemapperOf(ours))
        NumberByOne(*remapper, &Indexes::ours, &Indexes::theirs);
    else
        m_IsIdentity = true;
}

ListNumbering::Indexes& ListNumbering::At(int index) {
    const auto at = static_cast<std::size_t>(index);
    if (m_Elements.size() <= at) m_Elements.resize(at + 1);
    return m_Elements[at];
}

/// The other side has all elements where the base has them.
void ListNumbering::NumberByOne(const YAMLSequenceRemapper& remapper, int Indexes::*side,
                                int Indexes::*other) {
    m_Elements.resize(remapper.m_DestinationCount);
    for (std::size_t i = 0; i < m_Elements.size(); ++i) m_Elements[i].*side = static_cast<int>(i);
    for (std::size_t i = 0; i < remapper.m_Mapping.size(); ++i)
        if (remapper.m_Mapping[i] >= 0) {
            Indexes& element = At(remapper.m_Mapping[i]);
            element.base = element.*other = static_cast<int>(i);
        }
}

/// As MergeSequenceChanges does it: what both sides added under one key is left to theirs, and ours is
/// numbered without it.
void ListNumbering::NumberByBoth(const ChangeSequenceOperation& theirs, const ChangeSequenceOperation& ours,
                                 const ListRule& rule) {
    std::set<int> leftOut;
    if (theirs.m_Remapper->m_IsSet)
        for (const CommonAddition& common : FindCommonAdditions(*theirs.m_Diff, *ours.m_Diff, rule.keys)) {
            m_AddedByBoth[common.leftIndex] = common.rightIndex;
            leftOut.insert(common.rightIndex);
        }
    const YAMLSequenceRemapper* rest =
        leftOut.empty() ? ours.m_Remapper : ShiftRemapperDown(ours.m_Remapper, leftOut);
    const MergedRemappers numberings = MergeRemappers(theirs.m_Remapper, rest, true);
    const auto set = [&](const YAMLSequenceRemapper& toMerged, int Indexes::*version,
                         const std::set<int>& without) {
        int index = 0;
        for (const int merged : toMerged.m_Mapping) {
            while (without.contains(index)) ++index;
            if (merged >= 0) At(merged).*version = index;
            ++index;
        }
    };
    set(*numberings.merged, &Indexes::base, {});
    set(*numberings.leftToMerged, &Indexes::theirs, {});
    set(*numberings.rightToMerged, &Indexes::ours, leftOut);
    for (YAMLSequenceRemapper* made : {numberings.merged, numberings.leftToMerged, numberings.rightToMerged})
        YAMLAlloc<YAMLSequenceRemapper>::free(made);
    for (Indexes& element : m_Elements)
        if (const auto found = m_AddedByBoth.find(element.theirs); found != m_AddedByBoth.end())
            element.ours = found->second;
}

ListNumbering::Indexes ListNumbering::Merged(int index) const {
    if (m_IsIdentity) return {index, index, index};
    const auto at = static_cast<std::size_t>(index);
    return at < m_Elements.size() ? m_Elements[at] : Indexes();
}

std::optional<ListNumbering::Indexes> ListNumbering::AddedByBoth(int index) const {
    const auto found = m_AddedByBoth.find(index);
    if (found == m_AddedByBoth.end()) return std::nullopt;
    return Indexes{-1, found->second, index};
}

} // namespace ovrin
