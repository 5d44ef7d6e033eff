#include "Checks/Outline.h"

namespace ovrin {

void Outlines::Append(Outlines others) {
    const std::size_t before = references.size();
    for (ObjectOutline& object : others.objects) {
        object.firstReference += before;
        objects.push_back(object);
    }
    references.insert(references.end(), others.references.begin(), others.references.end());
    repeatedKeys.insert(repeatedKeys.end(), others.repeatedKeys.begin(), others.repeatedKeys.end());
}

} // namespace ovrin
