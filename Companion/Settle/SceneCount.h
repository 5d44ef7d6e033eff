#pragma once

#include "Conflicts/OpenMerge.h"

#include <nlohmann/json_fwd.hpp>
#include <string>

namespace ovrin {

class SettleSession;

/// How far a scene is.
struct SceneCount {
    std::string path;
    Occasion occasion = {};
    std::size_t open = 0;
    std::size_t settled = 0;
    bool isBothAdded = false;
    std::string problem = {}; ///< why nothing could be counted; empty if it could

    static SceneCount Of(const SettleSession& session);
    static SceneCount Of(const OpenMerge& merge, const Progress& progress);
};

/// "Scenes/Harbour.ovrin: 2 open conflicts, 1 settled (merge, ours is main, theirs is topic)".
std::string TellCount(const SceneCount& count);

/// {"path": ..., "action": "merge", "base": ..., "ours": "main", "theirs": "topic", "bothAdded": false,
///  "open": 2, "settled": 1, "problem": null}; labels are null where they aren't known.
nlohmann::json ToJson(const SceneCount& count);

} // namespace ovrin
