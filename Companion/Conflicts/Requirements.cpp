#include "Conflicts/Requirements.h"

#include "Names/ObjectBody.h"

#include "Repair/ComponentDependencies.h"

#include <algorithm>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

const YAMLMapping& TreeOf(MergeSession& session, Side side) {
    if (side == Side::Ours) return session.RightObjects().GetMapping();
    return side == Side::Theirs ? session.LeftObjects().GetMapping() : session.BaseObjects().GetMapping();
}

bool IsRequiredBy(const YAMLTypeInfo& required, const YAMLTypeInfo& by) {
    return std::ranges::any_of(by.m_Requires, [&](const YAMLScalar* type) {
        return type == required.m_ID || type == required.m_BaseID;
    });
}

/// The components in one version that need the object.
std::vector<const YAMLScalar*> NeededIn(const YAMLMapping& tree, const YAMLScalar* id,
                                        const YAMLTypeInfoManager& types) {
    std::vector<const YAMLScalar*> needing;
    const ObjectBody body = BodyOf(tree.Get(id));
    if (body.IsGameObject()) {
        for (const YAMLNode* entry : ItemsOf(body.Field(YAMLScalar::mComponent)))
            if (const YAMLScalar* component = ComponentOf(entry)) needing.push_back(component);
        return needing;
    }
    const YAMLScalar* owner = LocalReference(body.Field(YAMLScalar::mGameObject));
    if (!owner) return needing;
    const std::vector<GameObjectComponent> components = CollectGameObjectComponents(tree, owner, types);
    const auto required = std::ranges::find(components, id, &GameObjectComponent::id);
    if (required == components.end()) return needing;
    for (const GameObjectComponent& component : components)
        if (component.id != id && IsRequiredBy(*required->typeInfo, *component.typeInfo))
            needing.push_back(component.id);
    return needing;
}

} // namespace

std::vector<const YAMLScalar*> NeededBy(MergeSession& session, const YAMLScalar* id, Side side) {
    std::vector<const YAMLScalar*> needing;
    for (const Side other : {Side::Ours, Side::Theirs}) {
        if (other == side) continue;
        for (const YAMLScalar* component : NeededIn(TreeOf(session, other), id, session.Types()))
            if (!TreeOf(session, side).HasKey(component) && !TreeOf(session, Side::Base).HasKey(component) &&
                !std::ranges::count(needing, component))
                needing.push_back(component);
    }
    return needing;
}

} // namespace ovrin
