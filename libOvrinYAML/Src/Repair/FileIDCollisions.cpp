#include "Repair/FileIDCollisions.h"

#include "Repair/IDFilter.h"
#include "Repair/ObjectAccess.h"
#include "Repair/UnbuiltReferences.h"
#include "Values/AlignedLookup.h"
#include "Values/Hash.h"
#include "Values/OvrinObjects.h"

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

/// Gives an object the hash that reading it would give, in which the data of its header, from the file id on,
/// has no part.
void RebuildObjectHash(YAMLMapping& object) {
    std::uint32_t hash = 0, index = 0;
    for (const YAMLMapping::Entry entry : object) {
        if (entry.key == YAMLScalar::fileIDPlaceHolderName) break;
        hash = FoldPair(hash, entry.key->m_Hash, entry.value->m_Hash, index++);
    }
    object.m_Hash = hash;
}

/// Brings references to their new ids. What holds one gets the hash that reading it with the new id would
/// give: two additions that differ in nothing but the id must not count as one.
class ReferenceRewriter {
public:
    explicit ReferenceRewriter(const std::vector<NewID>& newIDs) {
        for (const NewID& newID : newIDs) m_Remap.emplace(newID.from, newID.to);
    }

    bool IsMoved(const YAMLScalar* id) const { return m_Remap.contains(id); }
    bool RefersToMoved(const YAMLMapping& mapping) const {
        return IsMoved(AsScalar(mapping.Get(YAMLScalar::fileID))) && !mapping.HasKey(YAMLScalar::guid);
    }

    /// Rewrites the references in an object.
    void RewriteObject(YAMLMapping& object) const {
        RewriteInside(object);
        RebuildObjectHash(object);
    }

private:
    /// Rewrites below a node. Returns whether there was a reference.
    bool Rewrite(YAMLNode* node) const {
        bool isChanged = false;
        if (YAMLMapping* mapping = AsMapping(node))
            isChanged = RewriteInside(*mapping);
        else if (YAMLSequence* sequence = AsSequence(node))
            for (YAMLNode* item : sequence->m_Items) isChanged |= Rewrite(item);
        if (isChanged) node->RebuildHash(true);
        return isChanged;
    }

    bool RewriteInside(YAMLMapping& mapping) const {
        const bool isReference = RefersToMoved(mapping);
        if (isReference) {
            const YAMLScalar* target = AsScalar(mapping.Get(YAMLScalar::fileID));
            mapping.Change(YAMLScalar::fileID, m_Remap.at(target)->Clone());
        }
        bool isChanged = isReference;
        for (const YAMLMapping::Entry entry : mapping) isChanged |= Rewrite(entry.value);
        return isChanged;
    }

    std::unordered_map<const YAMLScalar*, const YAMLScalar*> m_Remap;
};

/// Goes through the file even where no id moved, and so is also what notices repeated keys in it; objects
/// that are known to have none are passed over then.
void RewriteReferences(const std::vector<NewID>& newIDs, YAMLMapping& root, const TaskRunner& run) {
    const ReferenceRewriter rewriter(newIDs);
    const auto refersToMoved = [&](const YAMLScalar*, const YAMLMapping& mapping) {
        return rewriter.RefersToMoved(mapping);
    };
    std::vector<const YAMLScalar*> movedIDs;
    movedIDs.reserve(newIDs.size());
    for (const NewID& newID : newIDs) movedIDs.push_back(newID.from);
    const IDFilter moved(movedIDs);
    const auto isMoved = [&](std::string_view id) {
        return moved.MayContain(id) && rewriter.IsMoved(YAMLScalar::Lookup(id));
    };
    const auto mayRefer = [&](const YAMLMapping& object) {
        return !newIDs.empty() && MayRefer(object, *YAMLScalar::fileID, isMoved);
    };
    const auto refers = [&](const YAMLScalar* id, YAMLNode* object) {
        return !FindMappings(id, object, refersToMoved).empty();
    };
    ForEachObject(root, run, mayRefer, refers, [&](const YAMLScalar* id, YAMLNode* object) {
        if (refers(id, object)) rewriter.RewriteObject(Editable(root, id));
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
                              const YAMLMapping& left, YAMLMapping& right, const TaskRunner& run) {
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
        YAMLMapping& object = Editable(right, newID.to);
        object.Change(YAMLScalar::fileIDPlaceHolderName, newID.to->Clone());
        RebuildObjectHash(object);
    }
    RewriteReferences(newIDs, right, run);
}

} // namespace ovrin_yaml
