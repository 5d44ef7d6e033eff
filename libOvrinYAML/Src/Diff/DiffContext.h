#pragma once

#include "Diff/MergeRules.h"

namespace ovrin_yaml {

/// Where a diff stands: at a property path, which is extended on the way down and comes back as it was, under
/// rules that go by it. Each diff has one of its own, so that diffs under different rules don't meet.
struct DiffContext {
    explicit DiffContext(const MergeRules& mergeRules, Path start = {})
        : rules(mergeRules), path(std::move(start)) {}

    const MergeRules& rules; // must outlive the context
    Path path;
};

} // namespace ovrin_yaml
