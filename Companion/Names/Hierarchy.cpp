#include "Names/Hierarchy.h"

#include "Names/ObjectLabel.h"

#include <limits>
#include <map>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

const YAMLScalar* ChildrenKey() {
    static const YAMLScalar* const key = YAMLScalar::Lookup("m_Children");
    return key;
}

} // namespace

std::size_t Hierarchy::KeyHash::operator()(const Key& key) const {
    const std::hash<ID> hash;
    return hash(key.owner) * 31 + hash(key.part);
}

const YAMLNode* Hierarchy::Find(ID id) const {
    if (!m_Root.HasDuplicates()) return m_Root.Get(id);
    if (m_FirstOfID.empty())
        for (const YAMLMapping::Entry entry : m_Root.RawEntries())
            m_FirstOfID.emplace(entry.key, entry.value);
    const auto found = m_FirstOfID.find(id);
    return found == m_FirstOfID.end() ? nullptr : found->second;
}

bool Hierarchy::IsPlace(const ObjectBody& body) {
    return (body.IsGameObject() && !body.isStripped) || body.IsPrefabInstance();
}

Hierarchy::ID Hierarchy::PlaceIDOf(const ObjectBody& body, ID id) const {
    if (IsPlace(body)) return id;
    if (body.isStripped) return InstanceOf(body);
    const ID owner = LocalReference(body.Field(YAMLScalar::mGameObject));
    if (!owner) return nullptr;
    const ObjectBody ownerBody = Body(owner);
    const ID instance = ownerBody.isStripped ? InstanceOf(ownerBody) : nullptr;
    return instance ? instance : owner;
}

Hierarchy::ID Hierarchy::TransformOf(const ObjectBody& gameObject) const {
    for (const YAMLNode* entry : ItemsOf(gameObject.Field(YAMLScalar::mComponent)))
        if (const ID component = ComponentOf(entry); component && Body(component).IsTransform())
            return component;
    return nullptr;
}

Hierarchy::Holder Hierarchy::HolderOf(const YAMLNode* transformReference) const {
    const ID transform = LocalReference(transformReference);
    if (!transform) return {};
    const ID place = PlaceIDOf(Body(transform), transform);
    if (place && IsPlace(Body(place))) return {place, nullptr};
    return {nullptr, transform};
}

Hierarchy::Holder Hierarchy::ParentOf(const ObjectBody& body) const {
    if (body.IsPrefabInstance())
        return HolderOf(FieldOf(body.Field(YAMLScalar::mModification), YAMLScalar::mTransformParent));
    const ID transform = TransformOf(body);
    return transform ? HolderOf(Body(transform).Field(YAMLScalar::mFather)) : Holder();
}

const Hierarchy::Place& Hierarchy::PlaceOf(ID id) const {
    std::vector<Place*> way; // upwards; their heads are null as long as they stand in it
    const Place* above = nullptr;
    while (id) {
        const auto [found, isNew] = m_Places.try_emplace(id);
        Place& place = found->second;
        above = &place;
        if (!isNew) break;
        const ObjectBody body = Body(id);
        const Holder parent = ParentOf(body);
        place.id = id;
        place.label = PlaceLabel(body);
        place.missing = parent.missing;
        way.push_back(&place);
        id = parent.place;
    }
    return Connect(way, id ? above : nullptr);
}

/// `above` is the place that the way leads to, which may stand in it; null if it ends at the top. Returns the
/// first of the way, or `above` if it is empty.
const Hierarchy::Place& Hierarchy::Connect(std::span<Place* const> way, const Place* above) const {
    std::size_t count = way.size();
    if (above && !above->head) {
        // All members of a loop stand at the top, so that no name depends on where the way began.
        const Place* lowest = nullptr;
        while (lowest != above) {
            Place& member = *way[--count];
            member.isInLoop = true;
            member.head = lowest = &member;
        }
    }
    for (; count > 0; above = way[count]) {
        Place& place = *way[--count];
        place.parent = above;
        place.depth = above ? above->depth + 1 : 0;
        place.head = place.depth > kHeadDepth ? above->head : &place;
    }
    return way.empty() ? *above : *way.front();
}

void Hierarchy::NumberComponents(ID owner) const {
    std::map<std::string, unsigned> counts;
    std::vector<std::pair<ID, Component*>> listed;
    std::uint32_t position = 0;
    for (const YAMLNode* entry : ItemsOf(Body(owner).Field(YAMLScalar::mComponent))) {
        const ID id = ComponentOf(entry);
        if (!id || !Find(id)) continue;
        const auto [found, isNew] = m_Components.try_emplace({owner, id});
        if (!isNew) continue;
        found->second = {ClassLabel(Body(id)), 0, position++};
        ++counts[found->second.label];
        listed.emplace_back(id, &found->second);
    }
    std::erase_if(counts, [](const auto& count) { return count.second < 2; });
    if (counts.empty()) return;
    for (auto& [label, count] : counts) count = 0;
    for (const auto& [id, component] : listed)
        if (const auto repeated = counts.find(component->label); repeated != counts.end())
            component->number = ++repeated->second;
}

const Hierarchy::Component* Hierarchy::FindComponent(ID owner, ID component) const {
    if (m_WithComponents.insert(owner).second) NumberComponents(owner);
    const auto found = m_Components.find({owner, component});
    return found == m_Components.end() ? nullptr : &found->second;
}

void Hierarchy::NumberChildren(ID place) const {
    const ID transform = TransformOf(Body(place));
    if (!transform) return;
    std::uint32_t position = 0;
    for (const YAMLNode* child : ItemsOf(Body(transform).Field(ChildrenKey())))
        if (const ID id = LocalReference(child))
            if (const ID childPlace = PlaceIDOf(Body(id), id))
                m_Children.try_emplace({place, childPlace}, position++);
}

std::uint32_t Hierarchy::PositionAmongChildren(const Place& place) const {
    constexpr std::uint32_t kLast = std::numeric_limits<std::uint32_t>::max();
    if (!place.parent) return kLast;
    if (m_WithChildren.insert(place.parent->id).second) NumberChildren(place.parent->id);
    const auto found = m_Children.find({place.parent->id, place.id});
    return found == m_Children.end() ? kLast : found->second;
}

} // namespace ovrin
