#include "Settle/DecisionTable.h"

#include "Conflicts/DecisionPath.h"

namespace ovrin {

using namespace ovrin_yaml;

DecisionTable::DecisionTable(const std::vector<Decision>& decisions) {
    constexpr MergeResolve kResolves[] = {ResolveBase, ResolveRight, ResolveLeft};
    std::vector<RecordResolve> resolves;
    resolves.reserve(decisions.size());
    for (auto decision = decisions.rbegin(); decision != decisions.rend(); ++decision)
        resolves.push_back(
            {PathOfDecision(decision->path), kResolves[static_cast<std::size_t>(decision->side)]});
    m_Table.Set(resolves);
}

std::optional<Side> DecisionTable::Find(const Path& path) const {
    const std::optional<MergeResolve> resolve = m_Table.Find(path);
    if (!resolve) return {};
    return *resolve == ResolveBase ? Side::Base : *resolve == ResolveRight ? Side::Ours : Side::Theirs;
}

} // namespace ovrin
