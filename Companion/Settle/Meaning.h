#pragma once

#include "Conflicts/SceneMerge.h"
#include "Names/MergeNames.h"

#include <string>
#include <vector>

namespace ovrin {

class SettleSession;

/// The objects that a person calls `name`, by a name as it is shown or by the id: of those that open
/// conflicts are about and those that these stand under. Each once, in the order of the conflicts.
std::vector<MergeNames::ID> ObjectsCalled(const SettleSession& session, const std::string& name);

/// Whether the conflict is about the object `above`, or about one that stands under it in any version.
bool IsUnder(const MergeNames& names, const OpenConflict& conflict, MergeNames::ID above);

/// The paths of the conflicts that a person calls `name`: the object's name and, unless the object as a whole
/// is meant, the property behind a dot, "Harbour/Pier/Lantern · MonoBehaviour.m_Brightness". Both as they are
/// shown; the property also as it stands in the path.
std::vector<std::string> ConflictsCalled(SettleSession& session, const std::string& name);

} // namespace ovrin
