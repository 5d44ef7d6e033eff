#include "Names/ObjectNames.h"

#include "Names/ObjectLabel.h"
#include "Names/PrintableText.h"

#include <algorithm>
#include <vector>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

using Place = Hierarchy::Place;

/// Labels at the end of a path that is too long to be told as a whole.
constexpr std::uint32_t kTail = 16;

/// The labels from a place up to where `count` were taken or nothing is above.
void AddUpwards(const Place* place, std::uint32_t count, std::vector<std::string_view>& labels) {
    for (; place && count > 0; place = place->parent, --count) labels.push_back(place->label);
}

std::string JoinedUpwards(const std::vector<std::string_view>& labels) {
    std::string path;
    for (auto label = labels.rbegin(); label != labels.rend(); ++label) {
        if (!path.empty()) path += '/';
        path += *label;
    }
    return path;
}

} // namespace

std::string ObjectNames::Parts::Text() const {
    std::string text = place;
    if (!part.empty()) text += " · " + part;
    if (number) text += " " + std::to_string(number);
    return text;
}

std::string ObjectNames::PathOf(ID id) const {
    if (!Has(id)) return MissingLabel(id);
    const ObjectBody body = m_Hierarchy.Body(id);
    if (!Hierarchy::IsPlace(body)) return PlainLabel(body);
    const Place& place = m_Hierarchy.PlaceOf(id);
    std::vector<std::string_view> labels;
    if (place.depth > Hierarchy::kHeadDepth + kTail) {
        AddUpwards(&place, kTail, labels);
        labels.push_back("…");
        AddUpwards(place.head, Hierarchy::kHeadDepth + 1, labels);
    } else {
        AddUpwards(&place, place.depth + 1, labels);
    }
    const Place* top = place.head;
    while (top->parent) top = top->parent;
    const std::string missing = top->missing ? MissingLabel(top->missing) : "";
    if (top->missing) labels.push_back(missing);
    if (top->isInLoop) labels.push_back("(loop)");
    return JoinedUpwards(labels);
}

ObjectNames::Parts ObjectNames::NameOf(ID id) const {
    const YAMLNode* object = m_Hierarchy.Find(id);
    if (!object) return {MissingLabel(id), "", 0};
    const ObjectBody body = BodyOf(object);
    const ID place = m_Hierarchy.PlaceIDOf(body, id);
    if (!place) return {PlainLabel(body), "", 0};
    if (place == id) return {PathOf(id), "", 0};
    const Hierarchy::Component* component = m_Hierarchy.FindComponent(place, id);
    if (component) return {PathOf(place), component->label, component->number};
    return {PathOf(place), ClassLabel(body), 0};
}

std::string ObjectNames::NameWithID(ID id) const {
    if (!Has(id)) return MissingLabel(id);
    return Name(id) + " (" + Printable(id->Value()) + ")";
}

ObjectNames::ID ObjectNames::Above(ID id) const {
    const ObjectBody body = m_Hierarchy.Body(id);
    if (Hierarchy::IsPlace(body)) {
        const Place* parent = m_Hierarchy.PlaceOf(id).parent;
        return parent ? parent->id : nullptr;
    }
    const ID place = m_Hierarchy.PlaceIDOf(body, id);
    return place && Hierarchy::IsPlace(m_Hierarchy.Body(place)) ? place : nullptr;
}

} // namespace ovrin
