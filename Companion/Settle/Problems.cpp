#include "Settle/Problems.h"

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

/// "m_Target", "m_Slots[2].item".
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
        Problem problem{TextOf(broken), {}};
        const bool isGone = broken.kind == Breakage::Kind::Dangling || broken.kind == Breakage::Kind::LostParent;
        if (isGone) AddKeep(problem, broken.other);
        if (broken.kind != Breakage::Kind::WronglyListed) AddRemove(problem, broken.object);
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
    bool IsOpenAt(const Path& place) const { return m_OpenFields.contains({place[0], place[2]}); }

    /// "removed by theirs".
    std::string HowGone(ID id) const {
        if (m_Names.Has(Version::Base, id))
            for (const Side side : {Side::Ours, Side::Theirs})
                if (m_Structure.IsWithout(id, side)) return std::string("removed by ") + SideName(side);
        return "left out";
    }

    std::string TextOf(const Breakage& broken) const {
        const std::string object = m_Names.Name(broken.object), other = m_Names.Name(broken.other);
        const YAMLScalar* field = broken.place[2];
        const bool isList = field == YAMLScalar::mComponent;
        const std::string list = isList ? "the list of components of " : "the list of children of ";
        switch (broken.kind) {
        case Breakage::Kind::LostParent:
            return object + " stands at the top, since " + other + ", which it stood below, was " +
                   HowGone(broken.other);
        case Breakage::Kind::NotListed:
            return object + " isn't in " + list + other;
        case Breakage::Kind::WronglyListed:
            return other + " is in " + list + object + ", and belongs elsewhere";
        case Breakage::Kind::Dangling:
            break;
        }
        if (field == YAMLScalar::mGameObject || field == YAMLScalar::mFather)
            return object + " stays, and " + other + ", which it belongs to, was " + HowGone(broken.other);
        return object + ": " + PropertyAt(broken.place) + " refers to " + other + ", which was " +
               HowGone(broken.other);
    }

    void AddRemedy(Problem& problem, std::string text) {
        std::vector<Decision> decisions = m_Structure.Take();
        const auto isDecidable = [&](const Decision& decision) {
            return m_Decidable.contains(PathOfDecision(decision.path));
        };
        std::erase_if(decisions, [&](const Decision& decision) { return !isDecidable(decision); });
        if (!decisions.empty()) problem.remedies.push_back({std::move(text), std::move(decisions)});
    }

    void AddKeep(Problem& problem, ID id) {
        for (const Side without : {Side::Ours, Side::Theirs}) {
            if (!m_Structure.IsWithout(id, without)) continue;
            m_Structure.Keep({id}, without);
            AddRemedy(problem, "keep " + m_Names.Name(m_Structure.TopOf(id, without)) + ", too");
        }
    }

    void AddRemove(Problem& problem, ID id) {
        for (const Side without : {Side::Ours, Side::Theirs}) {
            if (!m_Structure.IsWithout(id, without)) continue;
            const ID whole = WholeOf(id, without);
            m_Structure.Remove({whole}, without);
            AddRemedy(problem, (m_Names.Has(Version::Base, id) ? "remove " : "leave out ") + m_Names.Name(whole) +
                                   ", too");
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
            Problem problem{m_Names.Name(id) + " was " + HowGone(id) + ", and " + m_Names.Name(needing.front()) +
                                " needs it",
                            {}};
            AddKeep(problem, id);
            m_Structure.Remove(needing, without);
            AddRemedy(problem, "leave out " + m_Names.Name(needing.front()));
            m_Found.push_back(std::move(problem));
        }
    }

    /// What other versions have at the place, or around it, if it doesn't break anything there.
    void AddSides(Problem& problem, const Breakage& broken) {
        for (const Side side : kSides)
            if (const Path path = DecidableAt(broken.place, side); !path.empty() && IsSound(side, broken, path)) {
                const std::string what = path.size() == 1 ? m_Names.Name(path.front()) : PropertyAt(path);
                if (path.size() == 1 && !m_Names.Has(VersionOf(side), path.front())) continue; // told already
                problem.remedies.push_back(
                    {"take " + what + " of " + SideName(side), {{DecisionPath(path), side}}});
            }
    }

    /// The longest beginning of a place at which the merge decides, or nothing.
    Path DecidableAt(Path place, Side) const {
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
        for (std::size_t i = 1; i < path.size() && path[i] != YAMLScalar::fileID; ++i) value = FieldOf(value, path[i]);
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
