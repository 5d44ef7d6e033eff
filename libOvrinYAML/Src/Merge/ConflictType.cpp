#include "Merge/ConflictType.h"

#include <cstddef>
#include <iterator>

namespace ovrin_yaml {

std::string ConflictTypeToStringHuman(ConflictType type) {
    static const char* const kTexts[] = {
        "none",         "Both adds",     "Both changes", "Both removes",  "Left adds",       "Right adds",
        "Left changes", "Right changes", "Left removes", "Right removes", "Transform cycle",
    };
    const auto index = static_cast<std::size_t>(type);
    return index < std::size(kTexts) ? kTexts[index] : "<unknown conflict type>";
}

} // namespace ovrin_yaml
