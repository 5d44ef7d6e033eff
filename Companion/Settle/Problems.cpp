#include "Settle/Problems.h"

#include "Conflicts/Conflict.h"
#include "Conflicts/DecisionPath.h"
#include "Conflicts/Requirements.h"
#include "Names/PropertyName.h"
#include "Settle/Breakages.h"
#include "Settle/StructureDecisions.h"

#include <algorithm>
#include <set>
#include <unordered_set>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

using ID = MergeNames::ID;

constexpr Side kSides[] = {Side::Ours, Side::Theirs, Side::Base};

const YAMLScalar* ChildrenKey() {
    static const YAMLScalar* const key = YAMLScalar::Lookup("m_Children");
    return key;
}

/// The field of an object that a place is in; null for an object that has no fields.
const YAMLScalar* FieldAt(const Path& place) {
    return place.size() > 2 ? place[2] : nullptr;
}

/// "m_Target", "m_Slots[2].item"; empty for an object that has no fields.
std::string PropertyAt(const Path& place) {
    std::string words;
    for (std::size_t i = 2; i < place.size(); ++i) {
        const std::string_view key = place[i]->Value();
        const bool isIndex = !key.empty() && key.find_first_not_of("0123456789") == std::string_view::npos;
        if (isIndex)
            AddElement(words, std::string(key));
        else
            AddKey(words, place[i]);
    }
    return words;
}

class Problems {
public:
    Problems(SceneMerge& merge, const MergeNames& names)
        : m_Merge(merge), m_Names(names), m_Structure(merge, names, merge.Open()) {
        for (const OpenConflict& conflict : merge.Open()) LeaveTo(conflict);
        for (const MergeSession::Record& record : merge.Session().Resolver().Records())
            m_Decidable.insert(record.path.Elements());
    }

    void AddBroken(const Breakage& broken) {
        if (IsOpen(broken.object) || IsOpen(broken.other) || IsOpenAt(broken.place)) return;
        if (IsPlaceOpen(broken)) return;
        Problem problem{TextOf(broken), {}};
        const bool isGone =
            broken.kind == Breakage::Kind::Dangling || broken.kind == Breakage::Kind::LostParent;
        if (isGone) AddKeep(problem, broken.other);
        if (isGone || broken.kind == Breakage::Kind::NotListed) AddRemove(problem, broken.object);
        AddSides(problem, broken);
        m_Found.push_back(std::move(problem));
    }

    void AddRequirements() {
        if (!m_Merge.HasBrokenDependencies()) return;
        std::set<Path> open;
        for (const OpenConflict& conflict : m_Merge.Open()) open.insert(conflict.path);
        for (const MergeSession::Record* record : m_Merge.Session().PendingConflicts()) {
            const ID id = record->path.OnlyElement();
            if (id && !open.contains(Path{id})) AddRequirement(id);
        }
    }

    std::vector<Problem> Take() { return std::move(m_Found); }

private:
    /// What an open conflict is about is told by it.
    void LeaveTo(const OpenConflict& conflict) {
        const ID id = conflict.path.front();
        if (conflict.path.size() > 2) {
            m_OpenFields.insert({id, conflict.path[2]});
            return;
        }
        m_OpenObjects.insert(id);
        for (const Side without : {Side::Ours, Side::Theirs})
            if (m_Structure.IsWithout(id, without)) m_OpenObjects.insert(m_Structure.TopOf(id, without));
    }

    bool IsOpen(ID id) {
        if (m_OpenObjects.contains(id)) return true;
        return std::ranges::any_of(kSides, [&](Side without) {
            return without != Side::Base && m_Structure.IsWithout(id, without) &&
                   m_OpenObjects.contains(m_Structure.TopOf(id, without));
        });
    }
    bool IsOpenAt(const Path& place) const { return m_OpenFields.contains({place[0], FieldAt(place)}); }
    /// Whether it is open what the child stands below that a list has or lacks.
    bool IsPlaceOpen(const Breakage& broken) const {
        const ID child = broken.kind == Breakage::Kind::NotListed       ? broken.object
                         : broken.kind == Breakage::Kind::WronglyListed ? broken.other
                                                                        : nullptr;
        return child && m_OpenFields.contains({child, YAMLScalar::mFather});
    }

    /// "removed by theirs".
    std::string HowGone(ID id) const {
        const ID cause = CauseOf(id);
        if (m_Names.Has(Version::Base, cause))
            for (const Side side : {Side::Ours, Side::Theirs})
                if (m_Structure.IsWithout(cause, side)) return std::string("removed by ") + SideName(side);
        return "left out";
    }

    /// As the version has it whose name comes first: one name is enough here.
    std::string LeadingName(ID id) const {
        return m_Names.In(m_Names.Leading(id).value_or(Version::Ours)).Name(id);
    }
    /// The same, where a Transform is called by what it places.
    std::string NameOf(ID id) const {
        const ObjectNames& names = m_Names.In(m_Names.Leading(id).value_or(Version::Ours));
        const ID place = names.Places().Body(id).IsTransform() ? names.Above(id) : nullptr;
        return LeadingName(place ? place : id);
    }

    /// The name of its place without the way to it.
    std::string LabelOf(ID transform) const {
        const Hierarchy& places = m_Names.In(m_Names.Leading(transform).value_or(Version::Ours)).Places();
        const ID place = places.PlaceIDOf(places.Body(transform), transform);
        return place ? places.PlaceOf(place).label : LeadingName(transform);
    }

    std::string TextOf(const Breakage& broken) const {
        const std::string object = NameOf(broken.object), other = NameOf(broken.other);
        const YAMLScalar* field = FieldAt(broken.place);
        const bool isComponents = field == YAMLScalar::mComponent;
        const std::string list = isComponents ? "the list of components of " : "the list of children of ";
        const std::string gone = HowGone(broken.other);
        switch (broken.kind) {
        case Breakage::Kind::LostParent:
            return object + " stands at the top, since " + other + ", which it stood below, was " + gone;
        case Breakage::Kind::Loop: // whose way up would be a long name
            return LabelOf(broken.object) + " stands below " + LabelOf(broken.other) + ", and that below " +
                   LabelOf(broken.object);
        case Breakage::Kind::NotListed:
            return object + " isn't in " + list + other;
        case Breakage::Kind::WronglyListed:
            return other + " is in " + list + object + ", and belongs elsewhere";
        case Breakage::Kind::Dangling:
            break;
        }
        if (field == YAMLScalar::mGameObject)
            return LeadingName(broken.object) + " stays, and " + other + ", which it belongs to, was " + gone;
        if (isComponents || field == ChildrenKey())
            return list + object + " names " + (isComponents ? LeadingName(broken.other) : other) +
                   ", which was " + gone;
        const std::string property = PropertyAt(broken.place);
        return LeadingName(broken.object) + (property.empty() ? "" : ": " + property) + " refers to " +
               LeadingName(broken.other) + ", which was " + gone;
    }

    void AddRemedy(Problem& problem, std::string text) {
        std::vector<Decision> decisions = m_Structure.Take();
        const auto isDecidable = [&](const Decision& decision) {
            return m_Decidable.contains(PathOfDecision(decision.path));
        };
        std::erase_if(decisions, [&](const Decision& decision) { return !isDecidable(decision); });
        if (!decisions.empty()) problem.remedies.push_back({std::move(text), std::move(decisions)});
    }

    /// What went because its prefab instance did is kept with that.
    ID CauseOf(ID id) const {
        for (const Side side : {Side::Ours, Side::Theirs}) {
            if (m_Structure.IsWithout(id, side)) return id;
            const ObjectBody body = m_Names.In(VersionOf(side)).Places().Body(id);
            if (const ID instance = body.isStripped ? InstanceOf(body) : nullptr)
                if (!m_Merge.Session().Result().GetMapping().HasKey(instance)) return instance;
        }
        return id;
    }

    void AddKeep(Problem& problem, ID missing) {
        const ID id = CauseOf(missing);
        for (const Side without : {Side::Ours, Side::Theirs}) {
            if (!m_Structure.IsWithout(id, without)) continue;
            m_Structure.Keep({id}, without);
            AddRemedy(problem, "keep " + NameOf(m_Structure.TopOf(id, without)) + ", too");
        }
    }

    void AddRemove(Problem& problem, ID id) {
        for (const Side without : {Side::Ours, Side::Theirs}) {
            if (!m_Structure.IsWithout(id, without)) continue;
            const ID whole = WholeOf(id, without);
            m_Structure.Remove({whole}, without);
            AddRemedy(problem,
                      (m_Names.Has(Version::Base, id) ? "remove " : "leave out ") + NameOf(whole) + ", too");
        }
    }

    /// A Transform goes with its GameObject.
    ID WholeOf(ID id, Side without) const {
        const ObjectNames& names = m_Names.In(VersionOf(OtherThan(without)));
        const ID above = names.Places().Body(id).IsTransform() ? names.Above(id) : nullptr;
        return above && m_Structure.IsWithout(above, without) ? above : id;
    }

    void AddRequirement(ID id) {
        for (const Side without : {Side::Ours, Side::Theirs}) {
            if (!m_Structure.IsWithout(id, without)) continue;
            const std::vector<ID> needing = NeededBy(m_Merge.Session(), id, without);
            if (needing.empty()) continue; // so it was on that side
            Problem problem{LeadingName(id) + " was " + HowGone(id) + ", and " +
                                LeadingName(needing.front()) + " needs it",
                            {}};
            AddKeep(problem, id);
            m_Structure.Remove(needing, without);
            AddRemedy(problem, "leave out " + LeadingName(needing.front()));
            m_Found.push_back(std::move(problem));
        }
    }

    /// What other versions have at the place, or around it, if it doesn't break anything there.
    void AddSides(Problem& problem, const Breakage& broken) {
        const Path path = DecidableAt(broken.place);
        if (path.empty()) return;
        for (const Side side : kSides)
            if (m_Names.Has(VersionOf(side), path.front()) && IsSound(side, broken, path))
                problem.remedies.push_back({WordsOfSide(side, broken, path), {{DecisionPath(path), side}}});
    }

    /// The whole of what is taken is named, since other changes may go with it.
    std::string WordsOfSide(Side side, const Breakage& broken, const Path& path) const {
        const std::string name = NameOf(path.front()), from = std::string(" from ") + SideName(side);
        if (path.size() <= 2) return "take " + name + from;
        if (path[2] == YAMLScalar::mFather) return "leave " + name + " where " + SideName(side) + " has it";
        if (path[2] != ChildrenKey() && path[2] != YAMLScalar::mComponent)
            return "take " + name + "'s " + PropertyAt(path) + from;
        const bool isWanted = broken.kind == Breakage::Kind::NotListed;
        const ID listed = isWanted ? broken.object : broken.other;
        const char* list = path[2] == ChildrenKey() ? "children" : "components";
        return (isWanted ? "list " : "don't list ") + NameOf(listed) + " there: take all " + list + " of " +
               name + from;
    }

    /// The longest beginning of a place at which the merge decides, or nothing.
    Path DecidableAt(Path place) const {
        for (std::size_t i = 2; i < place.size(); ++i)
            if (std::ranges::all_of(place[i]->Value(), [](char c) { return c >= '0' && c <= '9'; })) {
                place.resize(i); // within a list the merge counts otherwise
                break;
            }
        if (Path id = place; (id.push_back(YAMLScalar::fileID), m_Decidable.contains(id))) return id;
        while (!place.empty() && !m_Decidable.contains(place)) place.pop_back();
        return place.size() == 2 ? Path{} : place;
    }

    bool IsSound(Side side, const Breakage& broken, const Path& path) const {
        const YAMLNode* value = m_Names.In(VersionOf(side)).Find(path.front());
        for (std::size_t i = 1; i < path.size() && path[i] != YAMLScalar::fileID; ++i)
            value = FieldOf(value, path[i]);
        const ID named = broken.kind == Breakage::Kind::NotListed ? broken.object : broken.other;
        const bool names = Names(value, named);
        return broken.kind == Breakage::Kind::NotListed ? names : !names;
    }

    static bool Names(const YAMLNode* value, ID id) {
        if (LocalReference(value) == id) return true;
        if (const YAMLMapping* mapping = AsMapping(value))
            for (const auto& [key, field] : *mapping)
                if (Names(field, id)) return true;
        for (const YAMLNode* item : ItemsOf(value))
            if (Names(item, id)) return true;
        return false;
    }

    SceneMerge& m_Merge;
    const MergeNames& m_Names;
    StructureDecisions m_Structure;
    std::set<Path> m_Decidable; // only looked into
    std::unordered_set<ID> m_OpenObjects;
    std::set<std::pair<ID, ID>> m_OpenFields; // only looked into
    std::vector<Problem> m_Found;
};

} // namespace

std::vector<Problem> FindProblems(SceneMerge& merge, const MergeNames& names, std::size_t most) {
    const std::vector<Breakage> broken = Breakages(merge, names).Find();
    if (broken.empty() && !merge.HasBrokenDependencies()) return {};
    Problems problems(merge, names);
    problems.AddRequirements();
    for (const Breakage& one : broken) problems.AddBroken(one);
    std::vector<Problem> found = problems.Take();
    if (found.size() > most) {
        const std::string rest = std::to_string(found.size() - most);
        found.resize(most);
        found.push_back({"and " + rest + " more of the kind", {}});
    }
    return found;
}

} // namespace ovrin
