#include "Settle/StructureDecisions.h"

#include "Conflicts/Conflict.h"
#include "Conflicts/DecisionPath.h"

#include "Diff/YAMLMappingDiff.h"

#include <algorithm>
#include <iterator>

namespace ovrin {

using namespace ovrin_yaml;

using ID = StructureDecisions::ID;

namespace {

const YAMLScalar* ChildrenKey() {
    static const YAMLScalar* const key = YAMLScalar::Lookup("m_Children");
    return key;
}

} // namespace

Side OtherThan(Side side) {
    return side == Side::Ours ? Side::Theirs : Side::Ours;
}

StructureDecisions::StructureDecisions(SceneMerge& merge, const MergeNames& names,
                                       std::span<const OpenConflict> open)
    : m_Merge(merge), m_Names(names) {
    for (const OpenConflict& conflict : open)
        if (conflict.path.size() == 1) m_Open.insert(conflict.path.front());
}

ObjectBody StructureDecisions::Body(Side side, ID id) const {
    return BodyOf(m_Names.In(VersionOf(side)).Find(id));
}

ID StructureDecisions::ParentIn(Side side, ID transform) const {
    return LocalReference(Body(side, transform).Field(YAMLScalar::mFather));
}

ID StructureDecisions::TransformOf(ID gameObject, Side side) const {
    for (const YAMLNode* entry : ItemsOf(Body(side, gameObject).Field(YAMLScalar::mComponent)))
        if (const ID component = ComponentOf(entry); component && Body(side, component).IsTransform())
            return component;
    return nullptr;
}

bool StructureDecisions::IsWithout(ID id, Side without) const {
    return !m_Names.Has(VersionOf(without), id) && m_Names.Has(VersionOf(OtherThan(without)), id);
}

/// What was removed and what was added are told apart: each was done on its own.
ID StructureDecisions::TopOf(ID id, Side without) {
    const ObjectNames& names = m_Names.In(VersionOf(OtherThan(without)));
    std::unordered_map<ID, ID>& tops = m_Tops[static_cast<std::size_t>(without)];
    const bool wasInBase = WasInBase(id);
    std::vector<ID> way;
    ID top = id;
    for (ID at = id; at && (at == id || (IsWithout(at, without) && WasInBase(at) == wasInBase));
         at = names.Above(at)) {
        const auto known = tops.find(at);
        top = known == tops.end() ? at : known->second;
        if (known != tops.end()) break;
        way.push_back(at);
    }
    for (const ID below : way) tops.emplace(below, top);
    return top;
}

/// Of all that `without` lacks, what stands right under an object.
const std::vector<ID>& StructureDecisions::Below(ID id, Side without) {
    std::unordered_map<ID, std::vector<ID>>& below = m_Below[static_cast<std::size_t>(without)];
    if (!std::exchange(m_IsBelowKnown[static_cast<std::size_t>(without)], true)) {
        const ObjectNames& names = m_Names.In(VersionOf(OtherThan(without)));
        for (const Side side : {without, OtherThan(without)})
            for (const auto& [changed, operation] : Diff(side).Entries())
                if (IsWithout(changed, without) && (side == without) == WasInBase(changed))
                    if (const ID above = names.Above(changed)) below[above].push_back(changed);
    }
    return below[id];
}

void StructureDecisions::EndLoop(ID transform, Side side) {
    for (const Side dropped : {Side::Ours, Side::Theirs}) {
        const ID before = ParentIn(Side::Base, transform), after = ParentIn(dropped, transform);
        if (dropped == side || before == after) continue;
        for (const ID parent : {before, after})
            if (parent) DecideList(dropped, OtherThan(dropped), parent, ChildrenKey(), transform);
    }
}

void StructureDecisions::EndLoopAgain(ID transform, Side side) {
    EndLoop(transform, side);
    if (side == Side::Base) return;
    for (const ID parent : {ParentIn(Side::Base, transform), ParentIn(side, transform)})
        if (parent) DecideList(side, side, parent, ChildrenKey(), transform);
}

void StructureDecisions::Keep(const std::vector<ID>& ids, Side without) {
    DecideWhole(ids, without, OtherThan(without));
}

void StructureDecisions::AlreadyKept(const std::vector<ID>& ids, Side without) {
    const std::size_t before = m_Decisions.size();
    for (const ID id : ids) DecideEntries(TopOf(id, without), without, OtherThan(without));
    m_Decisions.erase(m_Decisions.begin() + static_cast<std::ptrdiff_t>(before), m_Decisions.end());
}

void StructureDecisions::Return(const std::vector<ID>& ids, Side without) {
    DecideWhole(ids, without, without);
}

void StructureDecisions::DecideWhole(const std::vector<ID>& ids, Side without, Side wanted) {
    std::unordered_set<ID> tops;
    for (const ID id : ids) {
        const ID top = TopOf(id, without);
        if (!tops.insert(top).second) continue;
        DecideEntries(top, without, wanted);
        DecideBelow(top, without, wanted, false);
    }
}

void StructureDecisions::Remove(const std::vector<ID>& ids, Side without) {
    for (const ID id : ids) {
        DecideEntries(id, without, without);
        DecideBelow(id, without, without, true);
    }
}

/// The lists that name an object follow.
void StructureDecisions::DecideEntries(ID top, Side without, Side wanted) {
    const Side keeper = OtherThan(without);
    const Side changer = WasInBase(top) ? without : keeper;
    if (const ID owner = LocalReference(Body(keeper, top).Field(YAMLScalar::mGameObject)))
        DecideList(changer, wanted, owner, YAMLScalar::mComponent, top);
    const ID transform = Body(keeper, top).IsTransform() ? top : TransformOf(top, keeper);
    const ID parent = transform ? ParentIn(keeper, transform) : nullptr;
    if (parent) DecideList(changer, wanted, parent, ChildrenKey(), transform);
}

/// An object, and what stands under it of the same kind, removed or added, or of both.
void StructureDecisions::DecideBelow(ID top, Side without, Side wanted, bool alsoOthers) {
    const bool wasInBase = WasInBase(top);
    std::vector<ID> waiting = {top};
    std::unordered_set<ID> seen = {top};
    while (!waiting.empty()) {
        const ID id = waiting.back();
        waiting.pop_back();
        if (!m_Open.contains(id)) m_Decisions.push_back({DecisionPath(Path{id}), wanted});
        for (const ID below : Below(id, without))
            if ((alsoOthers || WasInBase(below) == wasInBase) && seen.insert(below).second)
                waiting.push_back(below);
    }
}

std::set<ID> StructureDecisions::Listed(Side side, ID owner, const YAMLScalar* list) const {
    std::set<ID> ids;
    for (const YAMLNode* entry : ItemsOf(Body(side, owner).Field(list)))
        ids.insert(list == YAMLScalar::mComponent ? ComponentOf(entry) : LocalReference(entry));
    return ids;
}

/// The entries of a list that the side added or removed.
const std::set<ID>& StructureDecisions::Changed(Side side, ID owner, const YAMLScalar* list) {
    const auto [found, isNew] = m_Changed.try_emplace({side, owner, list});
    if (!isNew) return found->second;
    const std::set<ID> before = Listed(Side::Base, owner, list), after = Listed(side, owner, list);
    std::ranges::set_symmetric_difference(before, after, std::inserter(found->second, found->second.end()));
    return found->second;
}

/// Where all entries of a list that `changer` changed are wanted otherwise, the list becomes that of
/// `wanted`.
void StructureDecisions::DecideList(Side changer, Side wanted, ID owner, const YAMLScalar* list, ID entry) {
    const std::set<ID>& changed = Changed(changer, owner, list);
    if (!changed.contains(entry)) return;
    std::set<ID>& entries = m_WantedEntries[{changer, wanted, owner, list}];
    entries.insert(entry);
    if (entries.size() < changed.size()) return;
    // To take the change itself would drop what the other side changed there.
    if (wanted == changer && Listed(OtherThan(changer), owner, list) != Listed(Side::Base, owner, list))
        return;
    const Path path = PathOfChange(changer, owner, list);
    if (!path.empty()) m_Decisions.push_back({DecisionPath(path), wanted});
}

const YAMLMappingDiff& StructureDecisions::Diff(Side side) const {
    const MergeSession& session = m_Merge.Session();
    return side == Side::Ours ? session.RightDiff() : session.LeftDiff();
}

/// Where the change of a list can be decided on: an object that one side alone changed is merged as a whole.
/// Empty if other changes of the object would go with it.
Path StructureDecisions::PathOfChange(Side changer, ID owner, const YAMLScalar* list) const {
    const ObjectBody body = Body(changer, owner);
    if (!body.className) return {};
    if (Diff(OtherThan(changer)).HasKey(owner)) return {owner, body.className, list};
    const auto* object = As<ChangeMappingOperation>(Diff(changer).Find(owner));
    if (!object || object->m_Diff->Entries().size() != 1) return {};
    const auto* fields = As<ChangeMappingOperation>(object->m_Diff->Entries()[0].operation);
    return fields && fields->m_Diff->Entries().size() == 1 ? Path{owner} : Path{};
}

} // namespace ovrin
