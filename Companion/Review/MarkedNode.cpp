#include "Review/MarkedNode.h"

#include "Names/ObjectLabel.h"

namespace ovrin {

std::string OwnLabel(const ObjectNames& names, MergeNames::ID id) {
    const Hierarchy& places = names.Places();
    const ObjectBody body = places.Body(id);
    if (Hierarchy::IsPlace(body)) return places.PlaceOf(id).label;
    const MergeNames::ID owner = places.PlaceIDOf(body, id);
    if (!owner) return PlainLabel(body);
    const Hierarchy::Component* component = places.FindComponent(owner, id);
    if (!component) return ClassLabel(body);
    return component->number ? component->label + " " + std::to_string(component->number) : component->label;
}

} // namespace ovrin
