#include "Settle/Meaning.h"

#include "Conflicts/Conflict.h"
#include "Conflicts/DecisionPath.h"
#include "Settle/SettleSession.h"

#include <algorithm>
#include <span>

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

/// Visits the object and all that it stands under, in each version; ends where that returns true.
template <class Visit> bool AnyAbove(const MergeNames& names, ID object, const Visit& visit) {
    return std::ranges::any_of(kVersions, [&](Version version) {
        for (ID id = object; id && names.Has(version, id); id = names.In(version).Above(id))
            if (visit(id)) return true;
        return false;
    });
}

/// What may stand behind an object's name.
std::vector<std::string> PropertiesOf(const Conflict& conflict, const Path& path) {
    if (path.size() < 3) return {""};
    return {"." + conflict.property, "." + DecisionPath(std::span(path).subspan(2))};
}

} // namespace

std::vector<ID> ObjectsCalled(const SettleSession& session, const std::string& name) {
    std::vector<ID> called;
    for (const OpenConflict& conflict : session.Open())
        AnyAbove(session.Names(), conflict.path.front(), [&](ID id) {
            if (IsCalled(session.Names(), id, name) && std::ranges::find(called, id) == called.end())
                called.push_back(id);
            return false;
        });
    return called;
}

bool IsUnder(const MergeNames& names, const OpenConflict& conflict, ID above) {
    return AnyAbove(names, conflict.path.front(), [&](ID id) { return id == above; });
}

std::vector<std::string> ConflictsCalled(SettleSession& session, const std::string& name) {
    const ConflictWords words(session.Merge());
    std::vector<std::string> paths;
    for (const SettleSession::Met& met : session.Conflicts()) {
        const Path& path = met.conflict.path;
        const auto properties = PropertiesOf(words.Describe(met.conflict), path);
        const bool isCalled = std::ranges::any_of(properties, [&](const std::string& property) {
            return name.ends_with(property) &&
                   IsCalled(session.Names(), path.front(), name.substr(0, name.size() - property.size()));
        });
        if (isCalled) paths.push_back(DecisionPath(path));
    }
    return paths;
}

} // namespace ovrin
