#include "Settle/MetConflicts.h"

#include <algorithm>
#include <numeric>
#include <utility>

namespace ovrin {

void MetConflicts::Add(const std::vector<OpenConflict>& conflicts, const MergeNames& names) {
    for (const OpenConflict& conflict : conflicts)
        if (m_Indexes.try_emplace(conflict.path, size()).second) m_Conflicts.push_back(conflict);
    m_Proposed.resize(size());
    std::vector<MergeNames::ID> ids;
    for (const OpenConflict& conflict : m_Conflicts) ids.push_back(conflict.path.front());
    const std::vector<std::uint32_t> ranks = names.Ranks(ids);
    m_Order.resize(size());
    std::iota(m_Order.begin(), m_Order.end(), std::size_t{0});
    std::ranges::stable_sort(m_Order, {}, [&](std::size_t index) { return ranks[index]; });
    SetStates(std::exchange(m_States, {}));
}

std::optional<std::size_t> MetConflicts::Find(const ovrin_yaml::Path& path) const {
    const auto found = m_Indexes.find(path);
    return found == m_Indexes.end() ? std::nullopt : std::optional(found->second);
}

void MetConflicts::SetStates(std::vector<State> states) {
    m_States = std::move(states);
    m_States.resize(size());
    m_Open.clear();
    for (std::size_t i = 0; i < size(); ++i)
        if (m_States[i].isOpen) m_Open.push_back(m_Conflicts[i]);
}

std::vector<MetConflict> MetConflicts::InOrder() const {
    std::vector<MetConflict> met;
    met.reserve(size());
    for (const std::size_t i : m_Order) {
        const State& state = m_States[i];
        met.push_back(
            {&m_Conflicts[i], state.isOpen, state.decided, state.isOpen ? m_Proposed[i] : std::nullopt});
    }
    return met;
}

} // namespace ovrin
