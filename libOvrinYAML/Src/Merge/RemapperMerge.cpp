#include "Merge/RemapperMerge.h"

#include <algorithm>
#include <vector>

namespace ovrin_yaml {

namespace {

/// The destination index of base element `index`; -1 also for one that the destination doesn't have.
int TargetInDestination(const YAMLSequenceRemapper* remapper, std::size_t index) {
    const int target = remapper->Target(index);
    return target >= 0 && static_cast<std::size_t>(target) < remapper->m_DestinationCount ? target : -1;
}

/// Base element of each destination index, -1 for a new one.
std::vector<int> Invert(const YAMLSequenceRemapper* remapper) {
    std::vector<int> inverse(remapper->m_DestinationCount, -1);
    for (std::size_t i = 0; i < remapper->m_Mapping.size(); ++i) {
        const int target = TargetInDestination(remapper, i);
        if (target != -1) inverse[target] = static_cast<int>(i);
    }
    return inverse;
}

/// Numbers the new elements of a side from its index `k` on, up to the next that the base has.
void NumberAdditions(std::size_t k, const std::vector<int>& inverse, YAMLSequenceRemapper* toMerged,
                     int& next) {
    for (; k < inverse.size() && inverse[k] == -1; ++k) toMerged->m_Mapping[k] = next++;
}

} // namespace

MergedRemappers MergeRemappers(const YAMLSequenceRemapper* left, const YAMLSequenceRemapper* right,
                               bool removeUnmatched) {
    using Alloc = YAMLAlloc<YAMLSequenceRemapper>;
    YAMLSequenceRemapper* leftToMerged =
        Alloc::create(left->m_DestinationCount, left->m_DestinationCount, left->m_IsSet);
    YAMLSequenceRemapper* rightToMerged =
        Alloc::create(right->m_DestinationCount, right->m_DestinationCount, right->m_IsSet);
    const std::vector<int> leftInverse = Invert(left), rightInverse = Invert(right);
    int next = 0;
    NumberAdditions(0, leftInverse, leftToMerged, next);
    NumberAdditions(0, rightInverse, rightToMerged, next);
    YAMLSequenceRemapper* merged = Alloc::create(left->m_Mapping.size(), 0, left->m_IsSet && right->m_IsSet);
    for (std::size_t i = 0; i < left->m_Mapping.size(); ++i) {
        const int l = TargetInDestination(left, i), r = TargetInDestination(right, i);
        const bool goes = (l == -1 && r == -1) || (removeUnmatched && (l == -1 || r == -1));
        if (!goes) {
            if (l != -1) leftToMerged->m_Mapping[l] = next;
            if (r != -1) rightToMerged->m_Mapping[r] = next;
            merged->m_Mapping[i] = next++;
        }
        // What was added behind an element stays there, also if that element is gone from the merge.
        if (l != -1) NumberAdditions(static_cast<std::size_t>(l) + 1, leftInverse, leftToMerged, next);
        if (r != -1) NumberAdditions(static_cast<std::size_t>(r) + 1, rightInverse, rightToMerged, next);
    }
    merged->m_DestinationCount = static_cast<std::size_t>(next);
    return {merged, leftToMerged, rightToMerged};
}

const YAMLSequenceRemapper* ShiftRemapperDown(const YAMLSequenceRemapper* remapper,
                                              const std::set<int>& indexes) {
    const int count = static_cast<int>(remapper->m_DestinationCount);
    const std::vector<int> taken(indexes.begin(), indexes.lower_bound(count));
    YAMLSequenceRemapper* shifted = YAMLAlloc<YAMLSequenceRemapper>::create(
        0, remapper->m_DestinationCount - taken.size(), remapper->m_IsSet);
    shifted->m_Mapping.reserve(remapper->m_Mapping.size());
    for (const int target : remapper->m_Mapping) {
        const auto below = std::lower_bound(taken.begin(), taken.end(), target);
        if (below != taken.end() && *below == target) continue;
        shifted->m_Mapping.push_back(target - static_cast<int>(below - taken.begin()));
    }
    return shifted;
}

} // namespace ovrin_yaml
