#pragma once

#include <string>

namespace ovrin_yaml {

/// What happened at a property. Among the one-sided values, 4 to 9, the even ones are the left side's and the
/// odd ones the right side's.
enum ConflictType {
    ConflictNone = 0,
    ConflictBothAdds = 1,
    ConflictBothChanges = 2,
    ConflictBothRemoves = 3,
    ConflictLeftAdds = 4,
    ConflictRightAdds = 5,
    ConflictLeftChanges = 6,
    ConflictRightChanges = 7,
    ConflictLeftRemoves = 8,
    ConflictRightRemoves = 9,
    ConflictTransformCycle = 10,
    ConflictRemoveAgainstChange = 11,
};

inline bool IsOneSided(ConflictType type) {
    return type >= ConflictLeftAdds && type <= ConflictRightRemoves;
}
inline bool IsLeftSide(ConflictType type) {
    return type % 2 == 0;
}

/// The words of the report; "<unknown conflict type>" for a removal against a change and for no type at all.
std::string ConflictTypeToStringHuman(ConflictType type);

} // namespace ovrin_yaml
