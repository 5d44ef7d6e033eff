#pragma once

#include "Diff/CreateDiffOperation.h"
#include "Diff/DiffContext.h"
#include "Values/AlignedLookup.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLSequence.h"

#include <algorithm>

namespace ovrin_yaml {

/// Calls `visit(key, baseValue, destValue)` for each key whose values don't count as equal without a look
/// inside, with the path of `context` leading to them: the keys of `base` in their order, then those that
/// only `dest` has. A value is null on the side that lacks the key. Throws the duplicate-keys YAMLError if
/// one of the two is in the duplicate state.
template <class Visit>
void ForEachChildPair(DiffContext& context, const YAMLMapping* base, const YAMLMapping* dest,
                      const Visit& visit) {
    AlignedLookup destValues(*dest);
    for (const auto& [key, baseValue] : *base) {
        const YAMLNode* destValue = destValues.Get(key);
        if (CountAsEqual(baseValue, destValue)) continue;
        context.path.push_back(key);
        visit(key, baseValue, destValue);
        context.path.pop_back();
    }
    AlignedLookup baseValues(*base);
    for (const auto& [key, destValue] : *dest) {
        if (baseValues.Get(key)) continue;
        context.path.push_back(key);
        visit(key, nullptr, destValue);
        context.path.pop_back();
    }
}

/// The same for two lists, position by position: `visit(index, baseItem, destItem)`. `base` may hold holes.
template <class Visit>
void ForEachChildPair(DiffContext& context, const NodeList& base, const NodeList& dest, const Visit& visit) {
    const std::size_t count = std::max(base.size(), dest.size());
    for (std::size_t i = 0; i < count; ++i) {
        const YAMLNode* baseItem = i < base.size() ? base[i] : nullptr;
        const YAMLNode* destItem = i < dest.size() ? dest[i] : nullptr;
        if (CountAsEqual(baseItem, destItem)) continue;
        context.path.push_back(IndexScalar(static_cast<int>(i)));
        visit(static_cast<int>(i), baseItem, destItem);
        context.path.pop_back();
    }
}

} // namespace ovrin_yaml
