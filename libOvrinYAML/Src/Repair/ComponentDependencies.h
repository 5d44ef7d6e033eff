#pragma once

#include "Merge/YAMLConflict.h"
#include "Repair/YAMLTypeInfo.h"
#include "Values/YAMLMapping.h"

#include <vector>

namespace ovrin_yaml {

/// A component of a GameObject whose class the type information knows.
struct GameObjectComponent {
    const YAMLScalar* id;
    const YAMLTypeInfo* typeInfo;
};

/// The known components of the GameObject `id` of a root, in the order of its list; none if there is no such
/// GameObject.
std::vector<GameObjectComponent> CollectGameObjectComponents(const YAMLMapping& root, const YAMLScalar* id,
                                                             const YAMLTypeInfoManager& types);

/// The type ids that are required among the components of one GameObject and that none of them is of, each
/// once.
std::vector<const YAMLScalar*> UnmetRequirements(const std::vector<GameObjectComponent>& components);

/// What the removals of one side took from under the other's feet in the merged file: first the GameObjects
/// that components still name, then what components of the same GameObject require, both in document order
/// and each told once. The conflict's id is that of what is missing, on the side that still has it; with
/// neither side having it, there is none.
/// Without type information nothing is looked at. Nothing is changed.
std::vector<ComponentDependencyConflict> FindComponentDependencyConflicts(const YAMLMapping& merged,
                                                                          const YAMLMapping& left,
                                                                          const YAMLMapping& right,
                                                                          const YAMLTypeInfoManager& types);

} // namespace ovrin_yaml
