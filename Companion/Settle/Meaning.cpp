#include "Settle/Meaning.h"

#include "Conflicts/Conflict.h"
#include "Conflicts/DecisionPath.h"
#include "Settle/SettleSession.h"

#include <algorithm>
#include <span>
#include <unordered_set>

namespace ovrin {

namespace {

using ID = MergeNames::ID;
using ovrin_yaml::Path;

constexpr Version kVersions[] = {Version::Base, Version::Ours, Version::Theirs};

bool IsCalled(const MergeNames& names, ID id, const std::string& name) {
    if (id->Value() == name || names.Name(id) == name || names.NameWithID(id) == name) return true;
    return std::ranges::any_of(kVersions, [&](Version version) {
        return names.Has(version, id) && names.In(version).Name(id) == name;
    });
}

/// What may stand behind an object's name.
std::vector<std::string> PropertiesOf(const Conflict& conflict, const Path& path) {
    if (path.size() < 3) return {""};
    return {"." + conflict.property, "." + DecisionPath(std::span(path).subspan(2))};
}

} // namespace

/// Goes up from each object until something is known of all above, which may be as many as the scene has.
std::vector<ID> ObjectsCalled(const SettleSession& session, const std::string& name) {
    const MergeNames& names = session.Names();
    std::vector<ID> called;
    std::unordered_set<ID> asked;
    for (const Version version : kVersions) {
        std::unordered_set<ID> seen;
        for (const OpenConflict& conflict : session.Open())
            for (ID id = conflict.path.front(); id && names.Has(version, id) && seen.insert(id).second;
                 id = names.In(version).Above(id))
                if (asked.insert(id).second && IsCalled(names, id, name)) called.push_back(id);
    }
    return called;
}

bool UnderObject::IsMeant(const OpenConflict& conflict) {
    return std::ranges::any_of(kVersions,
                               [&](Version version) { return IsIn(version, conflict.path.front()); });
}

bool UnderObject::IsIn(Version version, ID id) {
    std::unordered_map<ID, bool>& known = m_Known[static_cast<std::size_t>(version)];
    std::vector<ID> way;
    while (id && id != m_Above && m_Names.Has(version, id) && !known.contains(id)) {
        way.push_back(id);
        id = m_Names.In(version).Above(id);
    }
    const auto found = known.find(id);
    const bool isUnder = found == known.end() ? id == m_Above && m_Names.Has(version, id) : found->second;
    for (const ID below : way) known.emplace(below, isUnder);
    return isUnder;
}

std::vector<std::string> ConflictsCalled(SettleSession& session, const std::string& name) {
    const ConflictWords words(session.Merge());
    std::vector<std::string> paths;
    for (const SettleSession::Met& met : session.Conflicts()) {
        const Path& path = met.conflict->path;
        const auto properties = PropertiesOf(words.Describe(*met.conflict), path);
        const bool isCalled = std::ranges::any_of(properties, [&](const std::string& property) {
            return name.ends_with(property) &&
                   IsCalled(session.Names(), path.front(), name.substr(0, name.size() - property.size()));
        });
        if (isCalled) paths.push_back(DecisionPath(path));
    }
    return paths;
}

} // namespace ovrin
