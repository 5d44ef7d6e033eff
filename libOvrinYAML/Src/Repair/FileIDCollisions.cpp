#include "Repair/FileIDCollisions.h"

#include "Document/AlignedLookup.h"
#include "Repair/ObjectAccess.h"

#include <algorithm>
#include <climits>
#include <unordered_map>
#include <unordered_set>

namespace ovrin_yaml {

namespace {

/// How far behind a colliding id a free one is looked for.
constexpr int kCandidates = 19;

struct NewID {
    const YAMLScalar* from;
    const YAMLScalar* to;
};

/// The class name of the object `id`, or null if it has none.
const YAMLScalar* ClassOf(const YAMLMapping& root, const YAMLScalar* id) {
    const YAMLMapping* object = AsMapping(root.Get(id));
    return object && object->begin() != object->end() ? object->begin()->key : nullptr;
}

/// The first of the candidates behind `id` that isTaken(const YAMLScalar*) denies.
template <class IsTaken> const YAMLScalar* NextFreeID(const YAMLScalar& id, const IsTaken& isTaken) {
    const int number = id.GetIntValue();
    for (int i = 1; number > 0 && i <= kCandidates && number <= INT_MAX - i; ++i) {
        const YAMLScalar* candidate = YAMLScalar::Lookup(IntToString(number + i));
        if (!isTaken(candidate)) return candidate;
    }
    throw YAMLError("Cannot create new fileID for conflicting fileID: " + std::string(id.Value()));
}

/// Goes through the file even where no id moved, and so is also what notices repeated keys in it; objects
/// that are known to have none are passed over then.
void RewriteReferences(const std::vector<NewID>& newIDs, YAMLMapping& root) {
    std::unordered_map<const YAMLScalar*, const YAMLScalar*> remap;
    for (const NewID& newID : newIDs) remap.emplace(newID.from, newID.to);
    const auto refersToMoved = [&](const YAMLScalar*, const YAMLMapping& mapping) {
        return remap.contains(AsScalar(mapping.Get(YAMLScalar::fileID))) && !mapping.HasKey(YAMLScalar::guid);
    };
    const auto isOfInterest = [&](std::uint8_t) { return !newIDs.empty(); };
    ForEachObject(root, isOfInterest, [&](const YAMLScalar* id, YAMLNode* object) {
        if (FindMappings(id, object, refersToMoved).empty()) return;
        for (YAMLMapping* reference : FindMappings(id, &Editable(root, id), refersToMoved)) {
            const YAMLScalar* target = AsScalar(reference->Get(YAMLScalar::fileID));
            reference->Change(YAMLScalar::fileID, remap.at(target)->Clone());
        }
    });
}

} // namespace

std::vector<const YAMLScalar*>
CreateConflictingFileIDsRemapper(const YAMLMapping& base, const YAMLMapping& left, const YAMLMapping& right) {
    std::vector<const YAMLScalar*> conflicts;
    AlignedLookup inBase(base);
    for (const auto& [id, object] : left)
        if (!inBase.Get(id) && right.HasKey(id)) conflicts.push_back(id);
    std::sort(conflicts.begin(), conflicts.end(), FileIDCompare());
    return conflicts;
}

void RemapCollidingAddFileIDs(const std::vector<const YAMLScalar*>& conflicts, const YAMLMapping& base,
                              const YAMLMapping& left, YAMLMapping& right) {
    std::unordered_set<const YAMLScalar*> handedOut;
    std::vector<NewID> newIDs;
    const auto isTaken = [&](const YAMLScalar* id) {
        return base.HasKey(id) || left.HasKey(id) || right.HasKey(id) || handedOut.contains(id);
    };
    for (const YAMLScalar* id : conflicts) {
        if (ClassOf(left, id) == ClassOf(right, id)) continue;
        newIDs.push_back({id, NextFreeID(*id, isTaken)});
        handedOut.insert(newIDs.back().to);
    }
    for (const NewID& newID : newIDs) {
        right.ChangeKey(newID.from, newID.to);
        Editable(right, newID.to).Change(YAMLScalar::fileIDPlaceHolderName, newID.to->Clone());
    }
    RewriteReferences(newIDs, right);
}

} // namespace ovrin_yaml
