#pragma once

#include <nlohmann/json_fwd.hpp>
#include <string>
#include <vector>

namespace ovrin {

struct Repository;
class SettleSession;

/// What is to be done once scenes are settled: the command that concludes what version control is in the
/// midst of, and what else it holds for unmerged. A line each.
std::vector<std::string> NextSteps(const Repository& repository, const std::string& action);

/// All conflicts of the session for people: the open ones with their values, the settled ones with the side.
std::string TellConflicts(SettleSession& session);
/// The same for scripts: that of SceneCount, and "conflicts", each as ToJson(Conflict) has it, with "state",
/// which is "open" or "settled", and "decided" and "proposed", each a side or null.
nlohmann::json ToJson(SettleSession& session);

} // namespace ovrin
