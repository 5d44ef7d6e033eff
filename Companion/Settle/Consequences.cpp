#include "Settle/Consequences.h"

#include "Conflicts/DecisionPath.h"
#include "Names/ObjectBody.h"

#include "Diff/YAMLMappingDiff.h"

#include <algorithm>
#include <array>
#include <iterator>
#include <map>
#include <set>
#include <tuple>
#include <unordered_map>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

using ID = MergeNames::ID;
using IDs = std::set<ID>; // only looked into: its order is that of addresses

Version VersionOf(Side side) {
    return side == Side::Base ? Version::Base : side == Side::Ours ? Version::Ours : Version::Theirs;
}

Side OtherThan(Side side) {
    return side == Side::Ours ? Side::Theirs : Side::Ours;
}

/// Finds decisions in the trees of a merge.
class Search {
public:
    Search(SceneMerge& merge, const MergeNames& names, std::span<const OpenConflict> open)
        : m_Merge(merge), m_Names(names) {
        for (const OpenConflict& conflict : open)
            if (conflict.path.size() == 1) m_Open.insert(conflict.path.front());
    }

    /// For a Transform in a loop, at which `side` is taken.
    void EndLoop(ID transform, Side side) {
        for (const Side dropped : {Side::Ours, Side::Theirs}) {
            const ID before = ParentIn(Side::Base, transform), after = ParentIn(dropped, transform);
            if (dropped == side || before == after) continue;
            for (const ID parent : {before, after}) DropChange(dropped, parent, "m_Children", transform);
        }
    }

    /// For objects that are kept although `remover` removed them.
    void Keep(const std::vector<ID>& kept, Side remover) {
        IDs tops;
        for (const ID id : kept) {
            const ID top = TopOfRemoval(id, remover);
            if (!tops.insert(top).second) continue;
            DropChange(remover, OwnerOf(top, remover), "m_Component", top);
            if (const ID transform = TransformOf(top, remover))
                DropChange(remover, ParentIn(OtherThan(remover), transform), "m_Children", transform);
        }
        for (const auto& [id, object] : m_Merge.Session().BaseObjects().GetMapping())
            if (IsRemoved(id, remover) && !m_Open.contains(id) && tops.contains(TopOfRemoval(id, remover)))
                m_Decisions.push_back({DecisionPath(Path{id}), OtherThan(remover)});
    }

    std::vector<Decision> Decisions() && { return std::move(m_Decisions); }

private:
    ObjectBody Body(Side side, ID id) const { return BodyOf(m_Names.In(VersionOf(side)).Find(id)); }

    ID ParentIn(Side side, ID transform) const {
        return LocalReference(Body(side, transform).Field(YAMLScalar::mFather));
    }

    /// By one side alone.
    bool IsRemoved(ID id, Side remover) const {
        return m_Names.Has(Version::Base, id) && !m_Names.Has(VersionOf(remover), id) &&
               m_Names.Has(VersionOf(OtherThan(remover)), id);
    }

    /// The highest object of those that were removed with this one.
    ID TopOfRemoval(ID id, Side remover) {
        const ObjectNames& names = m_Names.In(VersionOf(OtherThan(remover)));
        std::unordered_map<ID, ID>& tops = m_Tops[static_cast<std::size_t>(remover)];
        std::vector<ID> way;
        ID top = id;
        for (ID at = id; at && (at == id || IsRemoved(at, remover)); at = names.Above(at)) {
            const auto known = tops.find(at);
            top = known == tops.end() ? at : known->second;
            if (known != tops.end()) break;
            way.push_back(at);
        }
        for (const ID below : way) tops.emplace(below, top);
        return top;
    }

    /// The GameObject of a component.
    ID OwnerOf(ID id, Side remover) const {
        return LocalReference(Body(OtherThan(remover), id).Field(YAMLScalar::Lookup("m_GameObject")));
    }

    /// That of a GameObject.
    ID TransformOf(ID id, Side remover) const {
        const Side keeper = OtherThan(remover);
        for (const YAMLNode* entry : ItemsOf(Body(keeper, id).Field(YAMLScalar::mComponent)))
            if (const ID component = ComponentOf(entry); component && Body(keeper, component).IsTransform())
                return component;
        return nullptr;
    }

    IDs Listed(Side side, ID owner, const YAMLScalar* list) const {
        IDs ids;
        for (const YAMLNode* entry : ItemsOf(Body(side, owner).Field(list)))
            ids.insert(list == YAMLScalar::mComponent ? ComponentOf(entry) : LocalReference(entry));
        return ids;
    }

    /// The only entry of a list that the side added or removed; null where there are none or several.
    ID OnlyChange(Side side, ID owner, const YAMLScalar* list) {
        const auto [found, isNew] = m_OnlyChanges.try_emplace({side, owner, list}, nullptr);
        if (!isNew) return found->second;
        const IDs before = Listed(Side::Base, owner, list), after = Listed(side, owner, list);
        std::vector<ID> changed;
        std::ranges::set_symmetric_difference(before, after, std::back_inserter(changed));
        if (changed.size() == 1) found->second = changed.front();
        return found->second;
    }

    /// Takes the other side's list where all that the side changed in it is this entry.
    void DropChange(Side dropped, ID owner, const char* name, ID entry) {
        if (!owner) return;
        const YAMLScalar* list = YAMLScalar::Lookup(name);
        if (OnlyChange(dropped, owner, list) != entry) return;
        const Path path = PathOfChange(dropped, owner, list);
        if (!path.empty()) m_Decisions.push_back({DecisionPath(path), OtherThan(dropped)});
    }

    const YAMLMappingDiff& Diff(Side side) const {
        const MergeSession& session = m_Merge.Session();
        return side == Side::Ours ? session.RightDiff() : session.LeftDiff();
    }

    /// Where the change of a list can be decided on: an object that one side alone changed is merged as a
    /// whole. Empty if other changes of the object would go with it.
    Path PathOfChange(Side dropped, ID owner, const YAMLScalar* list) const {
        const ObjectBody body = Body(dropped, owner);
        if (!body.className) return {};
        if (Diff(OtherThan(dropped)).HasKey(owner)) return {owner, body.className, list};
        const auto* object = As<ChangeMappingOperation>(Diff(dropped).Find(owner));
        if (!object || object->m_Diff->Entries().size() != 1) return {};
        const auto* fields = As<ChangeMappingOperation>(object->m_Diff->Entries()[0].operation);
        return fields && fields->m_Diff->Entries().size() == 1 ? Path{owner} : Path{};
    }

    SceneMerge& m_Merge;
    const MergeNames& m_Names;
    IDs m_Open;
    // What was found, since many objects may have one list or stand above each other.
    std::array<std::unordered_map<ID, ID>, 3> m_Tops; // by the side that removed them
    std::map<std::tuple<Side, ID, const YAMLScalar*>, ID> m_OnlyChanges;
    std::vector<Decision> m_Decisions;
};

} // namespace

std::vector<Decision> Consequences(SceneMerge& merge, const MergeNames& names,
                                   std::span<const OpenConflict> open,
                                   std::span<const OpenConflict> conflicts, Side side) {
    Search search(merge, names, open);
    for (const OpenConflict& conflict : conflicts)
        if (conflict.kind == ConflictKind::ParentLoop) search.EndLoop(conflict.path.front(), side);
    for (const Side remover : {Side::Ours, Side::Theirs}) {
        std::vector<ID> kept;
        for (const OpenConflict& conflict : conflicts)
            if (conflict.path.size() == 1 && !names.Has(VersionOf(remover), conflict.path.front()) &&
                names.Has(VersionOf(side), conflict.path.front()))
                kept.push_back(conflict.path.front());
        if (!kept.empty()) search.Keep(kept, remover);
    }
    return std::move(search).Decisions();
}

} // namespace ovrin
