#pragma once

#include "Conflicts/Conflict.h"

#include <nlohmann/json_fwd.hpp>
#include <string>

namespace ovrin {

/// How the sides are called in a report.
struct SideLabels {
    std::string base, ours, theirs; ///< "main", "3f2a1c9 (Dim the light)"; empty where it isn't known

    const std::string& Of(Side side) const {
        return side == Side::Base ? base : side == Side::Ours ? ours : theirs;
    }
    static SideLabels Of(const Occasion& occasion) { return {occasion.base, occasion.ours, occasion.theirs}; }
};

/// One conflict, without the heading: what happened, and the values of all sides.
std::string TellConflict(const Conflict& conflict, const SideLabels& labels);

/// The open conflicts of a scene for people, a line or two each and the values of all sides:
///
///     Harbour/Pier/Lantern · Light (734813)
///       m_Brightness: both changed it
///         base    1
///         ours    5    main
///         theirs  2    topic
///
/// At most `most` of them, and how many more there are; 0 for all.
std::string TellConflicts(SceneMerge& merge, const SideLabels& labels, std::size_t most = 0);

/// The same for scripts: {"bothAdded": false, "open": 2, "conflicts": [...]}, each as ToJson(Conflict) has
/// it.
nlohmann::json ConflictsToJson(SceneMerge& merge);

/// A line that says what the sides are, in an action whose name leaves room for doubt:
///
///     ours is main, what you rebase onto; theirs is 3f2a1c9 (Dim the light), your own commit, which is put
///     on top of it
///
/// Empty for a plain merge.
std::string TellSides(const Occasion& occasion);

/// "1 open conflict", "3 open conflicts".
std::string CountOpen(std::size_t count);

} // namespace ovrin
