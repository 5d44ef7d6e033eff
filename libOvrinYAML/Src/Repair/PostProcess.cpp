#include "Repair/PostProcess.h"

#include "Repair/ComponentDependencies.h"
#include "Repair/ObjectAccess.h"
#include "Repair/PreProcess.h"
#include "Repair/TransformCycles.h"

namespace ovrin_yaml {

namespace {

void RepairPrefabLinks(const RepairRoots& roots) {
    std::vector<const YAMLScalar*> orphans;
    for (const auto& [id, object] : roots.merged) {
        const auto [classKey, fields] = GetTransform(object);
        const YAMLScalar* prefab = GetMappingPath(fields, {YAMLScalar::mPrefabInternal, YAMLScalar::fileID});
        if (IsNoReference(prefab) || !roots.IsRemoved(prefab)) continue;
        const YAMLScalar* gameObject = GetMappingPath(fields, {YAMLScalar::mGameObject, YAMLScalar::fileID});
        if (!IsNoReference(gameObject) && HasObject(roots.merged, gameObject))
            SetReference(roots.merged, id, classKey, YAMLScalar::mPrefabInternal, YAMLScalar::zero);
        else
            orphans.push_back(id);
    }
    RemoveObjects(roots.merged, orphans);
}

/// Whether a mapping is a prefab link to an object that the file hasn't.
struct IsDangling {
    const YAMLMapping& root;

    bool operator()(const YAMLScalar* key, const YAMLMapping& mapping) const {
        if (key != YAMLScalar::mPrefabInternal) return false;
        const YAMLScalar* target = AsScalar(mapping.Get(YAMLScalar::fileID));
        return target && target != YAMLScalar::zero && !root.HasKey(target);
    }
};

/// Whether an object is only the placeholder of a prefab instance's Transform whose prefab is gone.
bool IsPlaceHolderOfNothing(const YAMLMapping& object, const IsDangling& isDangling) {
    if (!object.HasKey(YAMLScalar::strippedPrefabPlaceHolderName)) return false;
    for (const YAMLScalar* classKey : {YAMLScalar::transform, YAMLScalar::rectTransform})
        if (!FindMappings(classKey, object.Get(classKey), isDangling).empty()) return true;
    return false;
}

/// Goes through the whole file, and so is also what notices repeated keys that came through the merge
/// unseen.
void RepairDanglingLinks(YAMLMapping& merged) {
    const IsDangling isDangling{merged};
    std::vector<const YAMLScalar*> placeHolders;
    for (const auto& [id, value] : merged) {
        const YAMLMapping* object = AsMapping(value);
        if (!object || FindMappings(id, value, isDangling).empty()) continue;
        if (IsPlaceHolderOfNothing(*object, isDangling)) {
            placeHolders.push_back(id);
            continue;
        }
        for (YAMLMapping* link : FindMappings(id, &Editable(merged, id), isDangling))
            link->Change(YAMLScalar::fileID, YAMLScalar::zero);
    }
    RemoveObjects(merged, placeHolders);
}

} // namespace

void PostProcessMergeOnly(YAMLMapping& merged, const YAMLMapping& left, const YAMLMapping& right,
                          ConflictResolver& resolver) {
    const RepairRoots roots{merged, left, right};
    RepairPrefabLinks(roots);
    CheckTransformHierarchy(roots, resolver);
    RepairDanglingLinks(merged);
    RestoreRepeatedKeys(merged);
}

void PostProcess(YAMLMapping& merged, const YAMLMapping& left, const YAMLMapping& right,
                 RecordingConflictResolver& resolver, bool& hasComponentDependencyConflicts) {
    PostProcessMergeOnly(merged, left, right, resolver);
    const std::vector<ComponentDependencyConflict> conflicts =
        FindComponentDependencyConflicts(merged, left, right, *GetTypeInfoManager());
    for (const ComponentDependencyConflict& conflict : conflicts)
        resolver.OnComponentDependencyConflict(conflict);
    hasComponentDependencyConflicts = !conflicts.empty();
}

} // namespace ovrin_yaml
