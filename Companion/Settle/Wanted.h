#pragma once

#include "Conflicts/OpenMerge.h"

#include <cstddef>
#include <memory>
#include <span>
#include <string>
#include <vector>

namespace ovrin {

class SettleSession;

/// A decision as a person gives it: for a path or pattern of the engine, or for a conflict by its name.
struct Wanted {
    std::string what;
    Side side;
};

/// "PATH=ours": cut at the last "=". Throws Failure for anything else.
Wanted ParseWanted(const std::string& text);

using Sessions = std::span<const std::unique_ptr<SettleSession>>;

/// Makes the decisions, each in the scenes in which it matches something. Throws Failure for one that matches
/// nothing, or several conflicts without being a pattern; then some sessions may have taken a step, and are
/// not to be kept.
void DecideWanted(Sessions sessions, std::span<const Wanted> wanted);

/// Makes the decisions of a file in the engine's form, of which the first that matches counts, in the only
/// session there is. Throws Failure as above, and where there are several sessions.
void DecideByFile(Sessions sessions, const std::string& file);

/// Takes a side for all open conflicts, or for those about the object called `under` and what stands under
/// it; empty for all. Throws Failure if that name matches nothing, or several objects of one scene. Returns
/// how many conflicts were settled.
std::size_t TakeSide(Sessions sessions, Side side, const std::string& under);
/// The same by what is proposed of each. Throws Failure also if nothing is proposed of any.
std::size_t TakeProposed(Sessions sessions, const std::string& under);

} // namespace ovrin
