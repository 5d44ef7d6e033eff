#pragma once

#include "Conflicts/SceneMerge.h"
#include "Names/MergeNames.h"

#include <array>
#include <string>
#include <unordered_map>
#include <vector>

namespace ovrin {

class SettleSession;

/// The objects that a person calls `name`, by a name as it is shown or by the id: of those that open
/// conflicts are about and those that these stand under. Each once.
std::vector<MergeNames::ID> ObjectsCalled(const SettleSession& session, const std::string& name);

/// Tells the conflicts that are about the object `above`, or about one that stands under it in any version.
/// All of them together take time linear in the objects that are gone through.
class UnderObject {
public:
    /// The names must stay.
    UnderObject(const MergeNames& names, MergeNames::ID above) : m_Names(names), m_Above(above) {}

    bool IsMeant(const OpenConflict& conflict);

private:
    bool IsIn(Version version, MergeNames::ID id);

    const MergeNames& m_Names;
    const MergeNames::ID m_Above;
    std::array<std::unordered_map<MergeNames::ID, bool>, 3> m_Known; // by version
};

/// The paths of the conflicts that a person calls `name`: the object's name and, unless the object as a whole
/// is meant, the property behind a dot, "Harbour/Pier/Lantern · MonoBehaviour.m_Brightness". Both as they are
/// shown; the property also as it stands in the path.
std::vector<std::string> ConflictsCalled(SettleSession& session, const std::string& name);

} // namespace ovrin
