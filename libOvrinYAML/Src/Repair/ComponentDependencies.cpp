#include "Repair/ComponentDependencies.h"

#include "Repair/ObjectAccess.h"

#include <algorithm>
#include <unordered_set>

namespace ovrin_yaml {

namespace {

using Components = std::vector<GameObjectComponent>;
using Conflicts = std::vector<ComponentDependencyConflict>;

/// The first pair of a mapping, which is what its class or kind stands in; nulls if it has none.
YAMLMapping::Entry FirstEntry(const YAMLNode* node) {
    const YAMLMapping* mapping = AsMapping(node);
    return mapping && mapping->begin() != mapping->end() ? *mapping->begin()
                                                         : YAMLMapping::Entry{nullptr, nullptr};
}

bool IsGameObject(const YAMLNode* object) {
    return FirstEntry(object).key == YAMLScalar::gameObject;
}

bool IsOf(const YAMLTypeInfo& type, const YAMLScalar* id) {
    return type.m_ID == id || type.m_BaseID == id;
}

/// The known component that an element of the list, `- component: {fileID: 12}`, stands for.
GameObjectComponent ComponentAt(const YAMLMapping& root, const YAMLNode* element,
                                const YAMLTypeInfoManager& types) {
    const YAMLScalar* id = GetMappingPath(AsMapping(FirstEntry(element).value), {YAMLScalar::fileID});
    const YAMLMapping* component = id ? AsMapping(root.Get(id)) : nullptr;
    return {id, types.GetTypeInfo(GetMappingPath(component, {YAMLScalar::classIDPlaceHolderName}))};
}

/// The GameObjects that components name and that are not there, in the order of the components.
void FindMissingGameObjects(const YAMLMapping& merged, const YAMLMapping& left, Conflicts& conflicts) {
    std::unordered_set<const YAMLScalar*> seen;
    for (const auto& [id, object] : merged) {
        if (IsGameObject(object)) continue;
        const YAMLMapping* fields = AsMapping(FirstEntry(object).value);
        const YAMLScalar* named = GetMappingPath(fields, {YAMLScalar::mGameObject, YAMLScalar::fileID});
        if (!named || IsGameObject(merged.Get(named)) || !seen.insert(named).second) continue;
        if (left.HasKey(named))
            conflicts.push_back({named, YAMLScalar::null, ConflictRightRemoves});
        else
            conflicts.push_back({YAMLScalar::null, named, ConflictLeftRemoves});
    }
}

const YAMLScalar* FindComponentOf(const Components& components, const YAMLScalar* type) {
    for (const GameObjectComponent& component : components)
        if (IsOf(*component.typeInfo, type)) return component.id;
    return YAMLScalar::null;
}

} // namespace

std::vector<GameObjectComponent> CollectGameObjectComponents(const YAMLMapping& root, const YAMLScalar* id,
                                                             const YAMLTypeInfoManager& types) {
    Components components;
    const YAMLNode* object = root.Get(id);
    const YAMLMapping* fields = IsGameObject(object) ? AsMapping(FirstEntry(object).value) : nullptr;
    const YAMLSequence* list = fields ? AsSequence(fields->Get(YAMLScalar::mComponent)) : nullptr;
    if (!list) return components;
    for (const YAMLNode* element : list->m_Items) {
        const GameObjectComponent component = ComponentAt(root, element, types);
        if (component.typeInfo) components.push_back(component);
    }
    return components;
}

std::vector<const YAMLScalar*> UnmetRequirements(const Components& components) {
    std::unordered_set<const YAMLScalar*> settled;
    for (const GameObjectComponent& component : components)
        settled.insert({component.typeInfo->m_ID, component.typeInfo->m_BaseID});
    std::vector<const YAMLScalar*> unmet;
    for (const GameObjectComponent& component : components)
        for (const YAMLScalar* required : component.typeInfo->m_Requires)
            if (settled.insert(required).second) unmet.push_back(required);
    return unmet;
}

std::vector<ComponentDependencyConflict> FindComponentDependencyConflicts(const YAMLMapping& merged,
                                                                          const YAMLMapping& left,
                                                                          const YAMLMapping& right,
                                                                          const YAMLTypeInfoManager& types) {
    Conflicts conflicts;
    if (!types.IsLoaded()) return conflicts;
    FindMissingGameObjects(merged, left, conflicts);
    for (const auto& [id, object] : merged) {
        const auto unmet = UnmetRequirements(CollectGameObjectComponents(merged, id, types));
        if (unmet.empty()) continue;
        const Components leftComponents = CollectGameObjectComponents(left, id, types);
        const Components rightComponents = CollectGameObjectComponents(right, id, types);
        for (const YAMLScalar* required : unmet) {
            const YAMLScalar* inLeft = FindComponentOf(leftComponents, required);
            conflicts.push_back({inLeft, FindComponentOf(rightComponents, required),
                                 inLeft ? ConflictRightRemoves : ConflictLeftRemoves});
        }
    }
    return conflicts;
}

} // namespace ovrin_yaml
