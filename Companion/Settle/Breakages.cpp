#include "Settle/Breakages.h"

#include "Diff/YAMLMappingDiff.h"

#include <algorithm>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

using ID = MergeNames::ID;

const YAMLScalar* ChildrenKey() {
    static const YAMLScalar* const key = YAMLScalar::Lookup("m_Children");
    return key;
}

/// Calls found(place, id) for each reference to an object of the same file in a value.
template <class Found> void ForEachReference(const YAMLNode* value, Path& place, const Found& found) {
    if (const ID id = LocalReference(value)) return found(place, id);
    if (const YAMLMapping* mapping = AsMapping(value)) {
        for (const auto& [key, field] : *mapping) {
            if (AsScalar(field)) continue;
            place.push_back(key);
            ForEachReference(field, place, found);
            place.pop_back();
        }
    } else if (const YAMLSequence* list = AsSequence(value)) {
        for (std::size_t i = 0; i < list->m_Items.size(); ++i) {
            if (AsScalar(list->m_Items[i])) continue;
            place.push_back(YAMLScalar::Lookup(std::to_string(i)));
            ForEachReference(list->m_Items[i], place, found);
            place.pop_back();
        }
    }
}

ID EntryOf(const YAMLNode* entry, ID list) {
    return list == YAMLScalar::mComponent ? ComponentOf(entry) : LocalReference(entry);
}

} // namespace

Breakages::Breakages(SceneMerge& merge, const MergeNames& names)
    : m_Merge(merge), m_Trees{&names.In(Version::Base).Places().Root(),
                              &names.In(Version::Ours).Places().Root(),
                              &names.In(Version::Theirs).Places().Root(),
                              &merge.Session().Result().GetMapping()} {}

ObjectBody Breakages::Body(std::size_t tree, ID id) const {
    return BodyOf(m_Trees[tree]->Get(id));
}

/// What stands for an object of a prefab goes with the instance, at the latest when scenes are merged.
bool Breakages::IsGone(std::size_t tree, ID id) const {
    const ObjectBody body = Body(tree, id);
    const ID instance = body.isStripped ? InstanceOf(body) : nullptr;
    return !Has(tree, id) || (instance && !Has(tree, instance));
}

/// Whether a version has it so already.
template <class IsSo> bool Breakages::IsOld(const IsSo& isSo) const {
    for (std::size_t tree = 0; tree < kResult; ++tree)
        if (isSo(tree)) return true;
    return false;
}

bool Breakages::RefersTo(std::size_t tree, ID object, ID other) const {
    bool refers = false;
    Path place;
    ForEachReference(Body(tree, object).fields, place, [&](const Path&, ID id) { refers |= id == other; });
    return refers;
}

const std::unordered_set<ID>& Breakages::Listed(std::size_t tree, ID owner, ID list) {
    const YAMLNode* value = Body(tree, owner).Field(list);
    const auto [found, isNew] = m_Lists.try_emplace({tree, value});
    if (isNew)
        for (const YAMLNode* entry : ItemsOf(value)) found->second.insert(EntryOf(entry, list));
    return found->second;
}

std::vector<Breakage> Breakages::Find() {
    std::unordered_set<ID> seen;
    const MergeSession& session = m_Merge.Session();
    for (const YAMLMappingDiff* diff : {&session.LeftDiff(), &session.RightDiff()})
        for (const auto& [id, operation] : diff->Entries())
            if (Has(kResult, id) && seen.insert(id).second) LookAt(id);
    return std::move(m_Found);
}

void Breakages::LookAt(ID object) {
    const ObjectBody body = Body(kResult, object);
    LookAtReferences(object, body);
    if (body.IsTransform()) {
        LookAtParent(object, body);
        LookIfListed(object, body, YAMLScalar::mFather, ChildrenKey());
        LookAtList(object, body, ChildrenKey(), YAMLScalar::mFather);
    }
    if (body.IsGameObject()) return LookAtList(object, body, YAMLScalar::mComponent, YAMLScalar::mGameObject);
    LookIfListed(object, body, YAMLScalar::mGameObject, YAMLScalar::mComponent);
}

void Breakages::LookAtReferences(ID object, const ObjectBody& body) {
    std::unordered_set<ID> told;
    Path place = {object, body.className};
    ForEachReference(body.fields, place, [&](const Path& at, ID other) {
        if (Has(kResult, other) || !told.insert(other).second) return;
        const auto isSo = [&](std::size_t tree) {
            return IsGone(tree, other) && Has(tree, object) && RefersTo(tree, object, other);
        };
        if (!IsOld(isSo)) m_Found.push_back({Breakage::Kind::Dangling, object, other, at});
    });
}

/// Whether the way up from a Transform leads back to it. All together take time linear in what is above them.
bool Breakages::IsInLoop(std::size_t tree, ID transform) {
    std::unordered_map<ID, bool>& known = m_InLoops[tree];
    std::vector<ID> way;
    std::unordered_map<ID, std::size_t> places;
    ID at = transform;
    while (at && !known.contains(at) && places.try_emplace(at, way.size()).second) {
        way.push_back(at);
        at = LocalReference(Body(tree, at).Field(YAMLScalar::mFather));
    }
    const auto met = places.find(at);
    const std::size_t loop = met == places.end() ? way.size() : met->second;
    for (std::size_t i = 0; i < way.size(); ++i) known[way[i]] = i >= loop;
    return known[transform];
}

/// A parent that is gone is replaced by none in the merge.
void Breakages::LookAtParent(ID object, const ObjectBody& body) {
    if (const ID parent = LocalReference(body.Field(YAMLScalar::mFather))) {
        const bool isLoop =
            IsInLoop(kResult, object) && !IsOld([&](std::size_t tree) { return IsInLoop(tree, object); });
        if (isLoop)
            m_Found.push_back(
                {Breakage::Kind::Loop, object, parent, {object, body.className, YAMLScalar::mFather}});
        return;
    }
    ID lost = nullptr;
    for (std::size_t tree = 0; tree < kResult; ++tree) {
        if (!Has(tree, object)) continue;
        const ID parent = LocalReference(Body(tree, object).Field(YAMLScalar::mFather));
        if (!parent || !Has(tree, parent)) return;
        if (!Has(kResult, parent)) lost = parent;
    }
    if (lost)
        m_Found.push_back(
            {Breakage::Kind::LostParent, object, lost, {object, body.className, YAMLScalar::mFather}});
}

void Breakages::LookIfListed(ID object, const ObjectBody& body, ID back, ID list) {
    const ID owner = LocalReference(body.Field(back));
    if (!owner || !Has(kResult, owner) || Listed(kResult, owner, list).contains(object)) return;
    const auto isSo = [&](std::size_t tree) {
        return Has(tree, object) && LocalReference(Body(tree, object).Field(back)) == owner &&
               !Listed(tree, owner, list).contains(object);
    };
    const Path place = {owner, Body(kResult, owner).className, list};
    if (!IsOld(isSo)) m_Found.push_back({Breakage::Kind::NotListed, object, owner, place});
}

void Breakages::LookAtList(ID owner, const ObjectBody& body, ID list, ID back) {
    for (const YAMLNode* item : ItemsOf(body.Field(list))) {
        const ID entry = EntryOf(item, list);
        if (!entry || !Has(kResult, entry)) continue;
        const auto isElsewhere = [&](std::size_t tree) {
            const ObjectBody listed = Body(tree, entry);
            return listed.fields && !listed.isStripped && LocalReference(listed.Field(back)) != owner;
        };
        if (!isElsewhere(kResult)) continue;
        const auto isSo = [&](std::size_t tree) {
            return Has(tree, owner) && isElsewhere(tree) && Listed(tree, owner, list).contains(entry);
        };
        if (!IsOld(isSo))
            m_Found.push_back({Breakage::Kind::WronglyListed, owner, entry, {owner, body.className, list}});
    }
}

} // namespace ovrin
