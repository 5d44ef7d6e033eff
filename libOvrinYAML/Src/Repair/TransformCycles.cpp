#include "Repair/TransformCycles.h"

#include <stdexcept>
#include <unordered_map>

namespace ovrin_yaml {

namespace {

/// Walks of this length are taken for walks without end.
constexpr int kMaxAncestors = 100;

/// Of each Transform with a known parent, that parent. Asked for single keys only.
using TransformParents = std::unordered_map<const YAMLScalar*, const YAMLScalar*>;

/// The parent that a Transform names itself. A removed one is cut off in the tree, but it is still the
/// result: a walk must notice that it led there.
const YAMLScalar* OwnParent(const RepairRoots& roots, const YAMLScalar* id,
                            const TransformFields& transform) {
    const YAMLScalar* parent = GetMappingPath(transform.fields, {YAMLScalar::mFather, YAMLScalar::fileID});
    if (roots.IsRemoved(parent))
        SetReference(roots.merged, id, transform.classKey, YAMLScalar::mFather, YAMLScalar::zero);
    return parent;
}

/// The parent of a stripped Transform, which its prefab instance stores.
const YAMLScalar* PrefabParent(const YAMLMapping& merged, const YAMLScalar* id, const YAMLMapping& fields) {
    const YAMLScalar* link = nullptr;
    for (const YAMLScalar* key :
         {YAMLScalar::mPrefabInstance, YAMLScalar::mPrefabInternal, YAMLScalar::mPrefab})
        if (!link) link = GetMappingPath(&fields, {key, YAMLScalar::fileID});
    if (!link) throw YAMLError("Could not determine the transform parent of " + std::string(id->Value()));

    const YAMLMapping* instance = AsMapping(merged.Get(link));
    for (const YAMLScalar* classKey : {YAMLScalar::prefab, YAMLScalar::prefabInstance}) {
        const YAMLScalar* parent =
            GetMappingPath(instance, {classKey, YAMLScalar::mModification, YAMLScalar::mTransformParent,
                                      YAMLScalar::fileID});
        if (parent) return parent;
    }
    return nullptr;
}

TransformParents RepairParents(const RepairRoots& roots) {
    TransformParents parents;
    for (const auto& [id, object] : roots.merged) {
        const TransformFields transform = GetTransform(object);
        if (!transform.fields) continue;
        const YAMLScalar* parent = transform.fields->HasKey(YAMLScalar::mFather)
                                       ? OwnParent(roots, id, transform)
                                       : PrefabParent(roots.merged, id, *transform.fields);
        if (parent) parents.emplace(id, parent);
    }
    return parents;
}

bool IsInCycle(const YAMLScalar* start, const TransformParents& parents) {
    const YAMLScalar* current = start;
    for (int steps = 0; steps < kMaxAncestors; ++steps) {
        const auto found = parents.find(current);
        if (found == parents.end()) throw std::runtime_error("Cannot find transform parent for fileID");
        const YAMLScalar* parent = found->second;
        if (IsNoReference(parent)) return false;
        if (parent == start) return true;
        current = parent;
    }
    return true;
}

} // namespace

void CheckTransformHierarchy(const RepairRoots& roots, ConflictResolver& resolver) {
    const TransformParents parents = RepairParents(roots);
    for (const YAMLScalar* start : resolver.ChangedTransforms()) {
        if (!roots.merged.HasKey(start))
            throw std::runtime_error("Cannot find transform mapping from fileID while looking for cycles.");
        if (IsInCycle(start, parents))
            resolver.OnTransformCycleDetected(start, Editable(roots.merged, start));
    }
}

} // namespace ovrin_yaml
