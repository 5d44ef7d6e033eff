#include "Repair/PostProcess.h"

#include "Repair/ComponentDependencies.h"
#include "Repair/ObjectTraits.h"
#include "Repair/PreProcess.h"
#include "Repair/TransformCycles.h"
#include "Repair/UnbuiltReferences.h"

namespace ovrin_yaml {

namespace {

/// The objects that may have a prefab link to the file id that isMeant(std::string_view) tells of.
template <class IsMeant> auto MayHaveLinkTo(const IsMeant& isMeant) {
    return [isMeant](const YAMLMapping& object) {
        return object.Traits() & kHasPrefabLink && MayRefer(object, *YAMLScalar::mPrefabInternal, isMeant);
    };
}

void RepairPrefabLinks(RepairRoots& roots) {
    std::vector<const YAMLScalar*> orphans;
    const auto mayHaveLink =
        MayHaveLinkTo([&](std::string_view id) { return roots.IsRemoved(YAMLScalar::Lookup(id)); });
    const auto hasLink = [&](const YAMLScalar*, const YAMLNode* object) {
        const YAMLScalar* prefab =
            GetMappingPath(GetTransform(object).fields, {YAMLScalar::mPrefabInternal, YAMLScalar::fileID});
        return !IsNoReference(prefab) && roots.IsRemoved(prefab);
    };
    ForEachObject(roots.merged, roots.run, mayHaveLink, hasLink, [&](const YAMLScalar* id, YAMLNode* object) {
        if (!hasLink(id, object)) return;
        const auto [classKey, fields] = GetTransform(object);
        const YAMLScalar* gameObject = GetMappingPath(fields, {YAMLScalar::mGameObject, YAMLScalar::fileID});
        if (!IsNoReference(gameObject) && HasObject(roots.merged, gameObject))
            SetReference(roots.merged, id, classKey, YAMLScalar::mPrefabInternal, YAMLScalar::zero);
        else
            orphans.push_back(id);
    });
    roots.RemoveObjects(orphans);
}

/// Whether a mapping is a prefab link to an object that the file hasn't.
struct IsDangling {
    const YAMLMapping& root;

    bool operator()(const YAMLScalar* key, const YAMLMapping& mapping) const {
        return IsPrefabLink(key, mapping) && !root.HasKey(AsScalar(mapping.Get(YAMLScalar::fileID)));
    }
};

/// Whether an object is only the placeholder of a prefab instance's Transform whose prefab is gone.
bool IsPlaceHolderOfNothing(const YAMLMapping& object, const IsDangling& isDangling) {
    if (!object.HasKey(YAMLScalar::strippedPrefabPlaceHolderName)) return false;
    for (const YAMLScalar* classKey : {YAMLScalar::transform, YAMLScalar::rectTransform})
        if (!FindMappings(classKey, object.Get(classKey), isDangling).empty()) return true;
    return false;
}

/// Goes through all that the merge touched or that may have a dangling link, and so is also what notices
/// repeated keys that came through the merge unseen.
void RepairDanglingLinks(RepairRoots& roots) {
    const IsDangling isDangling{roots.merged};
    std::vector<const YAMLScalar*> placeHolders;
    const auto mayHaveLink = MayHaveLinkTo(
        [&](std::string_view id) { return id != "0" && !roots.merged.HasKey(YAMLScalar::Lookup(id)); });
    const auto hasLink = [&](const YAMLScalar* id, YAMLNode* value) {
        return AsMapping(value) && !FindMappings(id, value, isDangling).empty();
    };
    ForEachObject(roots.merged, roots.run, mayHaveLink, hasLink, [&](const YAMLScalar* id, YAMLNode* value) {
        if (!hasLink(id, value)) return;
        if (IsPlaceHolderOfNothing(*AsMapping(value), isDangling)) {
            placeHolders.push_back(id);
            return;
        }
        for (YAMLMapping* link : FindMappings(id, &Editable(roots.merged, id), isDangling))
            link->Change(YAMLScalar::fileID, YAMLScalar::zero);
    });
    roots.RemoveObjects(placeHolders);
}

void RepairGraph(RepairRoots& roots, ConflictResolver& resolver) {
    RepairPrefabLinks(roots);
    CheckTransformHierarchy(roots, resolver);
    RepairDanglingLinks(roots);
    RestoreRepeatedKeys(roots.merged, roots.run);
}

} // namespace

void PostProcessMergeOnly(RepairRoots roots, ConflictResolver& resolver) {
    RepairGraph(roots, resolver);
}

bool PostProcess(RepairRoots roots, const YAMLTypeInfoManager& types, RecordingConflictResolver& resolver) {
    RepairGraph(roots, resolver);
    const std::vector<ComponentDependencyConflict> conflicts =
        FindComponentDependencyConflicts(roots.merged, roots.left, roots.right, types);
    for (const ComponentDependencyConflict& conflict : conflicts)
        resolver.OnComponentDependencyConflict(conflict);
    return !conflicts.empty();
}

} // namespace ovrin_yaml
