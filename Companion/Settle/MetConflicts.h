#pragma once

#include "Conflicts/SceneMerge.h"
#include "Names/MergeNames.h"

#include <cstddef>
#include <deque>
#include <map>
#include <optional>
#include <vector>

namespace ovrin {

/// Why a conflict that was decided is open: decisions on a loop of parents may contradict each other.
inline constexpr const char* kStillLoop = "with the sides that are taken, the objects would still be below "
                                          "each other: take one side for all of them";

/// A conflict that was met while a scene is settled.
struct MetConflict {
    const OpenConflict* conflict; ///< stays as long as the session
    bool isOpen;
    std::optional<Side> decided;       ///< by the decision that counts there; of an open one see kStillLoop
    std::optional<Side> proposed = {}; ///< what was decided of the same values before
};

/// All conflicts that were met, each once, and how they stand.
class MetConflicts {
public:
    /// How one of them stands.
    struct State {
        bool isOpen = true;
        std::optional<Side> decided = {};
    };

    /// Adds those that aren't among them, as open ones.
    void Add(const std::vector<OpenConflict>& conflicts, const MergeNames& names);

    std::size_t size() const { return m_Conflicts.size(); }
    const OpenConflict& operator[](std::size_t index) const { return m_Conflicts[index]; }
    /// The index of the one at a path, or nothing.
    std::optional<std::size_t> Find(const ovrin_yaml::Path& path) const;

    const State& StateOf(std::size_t index) const { return m_States[index]; }
    const std::vector<State>& States() const { return m_States; }
    /// Of the first `states.size()`; the others are open.
    void SetStates(std::vector<State> states);
    void SetProposed(std::size_t index, Side side) { m_Proposed[index] = side; }

    /// In the order of the hierarchy.
    std::vector<MetConflict> InOrder() const;
    /// The open ones, in the order in which they were met.
    const std::vector<OpenConflict>& Open() const { return m_Open; }

private:
    std::deque<OpenConflict> m_Conflicts;              // in the order in which they were met; none moves
    std::map<ovrin_yaml::Path, std::size_t> m_Indexes; // only looked into: its order is that of addresses
    std::vector<State> m_States;
    std::vector<std::optional<Side>> m_Proposed;
    std::vector<std::size_t> m_Order; // that of the hierarchy
    std::vector<OpenConflict> m_Open;
};

} // namespace ovrin
