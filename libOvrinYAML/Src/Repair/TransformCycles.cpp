#include "Repair/TransformCycles.h"

#include "Repair/IDFilter.h"
#include "Repair/ObjectTraits.h"
#include "Repair/UnbuiltReferences.h"

#include <stdexcept>
#include <unordered_map>

namespace ovrin_yaml {

namespace {

/// Walks of this length are taken for walks without end.
constexpr int kMaxAncestors = 100;

/// The parent of a stripped Transform, which its prefab instance stores.
const YAMLScalar* PrefabParent(const YAMLMapping& merged, const YAMLScalar* id, const YAMLMapping& fields) {
    const YAMLScalar* link = InstanceOf(fields);
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

/// The parents of all Transforms.
class TransformParents {
public:
    /// Repairs the parents that were removed. A removed one is cut off in the tree, but it is still the
    /// parent here: a walk must notice that it led there. Throws YAMLError for a stripped Transform without a
    /// link.
    explicit TransformParents(const RepairRoots& roots) : m_Merged(roots.merged) {
        const bool anyRemoved = !roots.removed.empty();
        const IDFilter removed(roots.removed);
        const auto isRemoved = [&](std::string_view parent) {
            return removed.MayContain(parent) && roots.IsRemoved(YAMLScalar::Lookup(parent));
        };
        const auto mayHaveOne = [&](const YAMLMapping& object) {
            const std::uint8_t traits = object.Traits();
            if (traits & kLacksFather) return (traits & kLacksInstance) != 0;
            return anyRemoved && traits & kIsTransform && MayRefer(object, *YAMLScalar::mFather, isRemoved);
        };
        const auto removedParent = [&](const YAMLScalar* id, const YAMLNode* object) -> const YAMLScalar* {
            const YAMLMapping* fields = GetTransform(object).fields;
            if (!fields) return nullptr;
            const YAMLScalar* parent = ParentOf(id, *fields);
            return fields->HasKey(YAMLScalar::mFather) && roots.IsRemoved(parent) ? parent : nullptr;
        };
        const auto visit = [&](const YAMLScalar* id, const YAMLNode* object) {
            const YAMLScalar* parent = removedParent(id, object);
            if (!parent) return;
            SetReference(roots.merged, id, GetTransform(object).classKey, YAMLScalar::mFather,
                         YAMLScalar::zero);
            m_RemovedParents.emplace(id, parent);
        };
        ForEachObject(roots.merged, roots.run, mayHaveOne, removedParent, visit);
    }

    /// Null if the Transform or its parent isn't known.
    const YAMLScalar* Find(const YAMLScalar* id) const {
        const auto removed = m_RemovedParents.find(id);
        if (removed != m_RemovedParents.end()) return removed->second;
        const TransformFields transform = GetTransform(m_Merged.Get(id));
        return transform.fields ? ParentOf(id, *transform.fields) : nullptr;
    }

private:
    const YAMLScalar* ParentOf(const YAMLScalar* id, const YAMLMapping& fields) const {
        if (fields.HasKey(YAMLScalar::mFather))
            return GetMappingPath(&fields, {YAMLScalar::mFather, YAMLScalar::fileID});
        return PrefabParent(m_Merged, id, fields);
    }

    const YAMLMapping& m_Merged;
    std::unordered_map<const YAMLScalar*, const YAMLScalar*> m_RemovedParents; // by Transform
};

bool IsInCycle(const YAMLScalar* start, const TransformParents& parents) {
    const YAMLScalar* current = start;
    for (int steps = 0; steps < kMaxAncestors; ++steps) {
        const YAMLScalar* parent = parents.Find(current);
        if (!parent) throw std::runtime_error("Cannot find transform parent for fileID");
        if (IsNoReference(parent)) return false;
        if (parent == start) return true;
        current = parent;
    }
    return true;
}

} // namespace

void CheckTransformHierarchy(const RepairRoots& roots, ConflictResolver& resolver) {
    const TransformParents parents(roots);
    std::vector<const YAMLScalar*> inCycle;
    for (const YAMLScalar* start : resolver.ChangedTransforms()) {
        if (!roots.merged.HasKey(start))
            throw std::runtime_error("Cannot find transform mapping from fileID while looking for cycles.");
        if (IsInCycle(start, parents)) inCycle.push_back(start);
    }
    // The resolver may break cycles: all have been found before it is asked about the first.
    for (const YAMLScalar* start : inCycle)
        resolver.OnTransformCycleDetected(start, Editable(roots.merged, start));
}

} // namespace ovrin_yaml
