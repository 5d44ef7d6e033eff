#pragma once

#include "Names/MergeNames.h"
#include "Review/ObjectMark.h"

#include <unordered_map>

namespace ovrin_yaml {
class MergeSession;
}

namespace ovrin {

/// The marks of all objects that either side of a session touched; what follows from another change, as
/// Changes/ChangedObjects.h has it, leaves no mark. The time goes by what the sides changed. The session must
/// have come as far as Diff; `names` are those of its trees.
std::unordered_map<MergeNames::ID, ObjectMark> FindMarks(const ovrin_yaml::MergeSession& session,
                                                         const MergeNames& names);

} // namespace ovrin
