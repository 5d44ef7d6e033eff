#include "Settle/Wanted.h"

#include "Conflicts/DecisionPath.h"
#include "FileUtils.h"
#include "Names/PrintableText.h"
#include "Settle/Meaning.h"
#include "Settle/SettleSession.h"
#include "Words/Failure.h"

#include "Merge/ConflictReport.h"

#include <algorithm>
#include <map>
#include <sstream>
#include <stdexcept>
#include <utility>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

/// A place in a scene that somebody may have meant.
struct Meant {
    SettleSession* session;
    std::string path;
};

bool IsPattern(const std::string& path) {
    return std::ranges::count(PathOfDecision(path), YAMLScalar::star) > 0;
}

std::vector<Meant> FindMeant(Sessions sessions, const std::string& what) {
    std::vector<Meant> meant;
    for (const auto& session : sessions) {
        if (session->Touches(what)) {
            meant.push_back({session.get(), what});
            continue;
        }
        for (std::string& path : ConflictsCalled(*session, what))
            meant.push_back({session.get(), std::move(path)});
    }
    return meant;
}

[[noreturn]] void FailWithNothing(const std::string& what) {
    throw Failure("\"" + Printable(what) +
                  "\" matches nothing that either side changed, so nothing was decided: "
                  "\"ovrin settle --list\" shows the conflicts");
}

[[noreturn]] void FailWithSeveral(const std::string& what, const std::vector<Meant>& meant) {
    std::string text = "\"" + Printable(what) + "\" may mean several conflicts, so nothing was decided:";
    for (const Meant& one : meant)
        text += "\n  " + Printable(one.path) + " in " + Printable(one.session->Source().path);
    throw Failure(text + "\nGive the path, and the file where there are several");
}

void MakeStep(SettleSession& session, const std::vector<Decision>& decisions, SettleSession::Follow follow) {
    const std::vector<Decision> unmatched = session.Decide(decisions, follow);
    if (!unmatched.empty()) FailWithNothing(unmatched.front().path);
}

Side SideOf(MergeResolve resolve) {
    return resolve == ResolveLeft ? Side::Theirs : resolve == ResolveRight ? Side::Ours : Side::Base;
}

/// The decisions of the file, the one that counts most last.
std::vector<Decision> ReadDecisionFile(const std::string& file) {
    std::string text;
    if (ReadWholeFile(file, text) != ReadResult::Complete)
        throw Failure("The file of decisions " + Printable(file) + " can't be read");
    std::istringstream stream(std::move(text));
    // It would take a lack of memory for the end of the text.
    stream.exceptions(std::ios_base::badbit);
    std::vector<Decision> decisions;
    try {
        for (const RecordResolve& resolve : ReadDecisions(stream))
            decisions.push_back({DecisionPath(resolve.path), SideOf(resolve.resolve)});
    } catch (const std::runtime_error& error) {
        const std::string reason = error.what();
        throw Failure("The file of decisions " + Printable(file) +
                      " can't be made out: " + reason.substr(0, reason.find(" specified on line")));
    }
    if (decisions.empty())
        throw Failure("The file " + Printable(file) + " has no decision below \"Conflict handling:\"");
    std::ranges::reverse(decisions);
    return decisions;
}

/// The object of the session that is called `name`; null if none is.
MergeNames::ID ObjectCalled(const SettleSession& session, const std::string& name) {
    const std::vector<MergeNames::ID> called = ObjectsCalled(session, name);
    if (called.size() < 2) return called.empty() ? nullptr : called.front();
    std::string text = "\"" + Printable(name) + "\" is the name of several objects in " +
                       Printable(session.Source().path) + ", so nothing was decided:";
    for (const MergeNames::ID id : called) text += "\n  " + session.Names().NameWithID(id);
    throw Failure(text + "\nGive the number instead of the name");
}

/// Calls take(session, isMeant) for the sessions that have something under an object of that name. Returns
/// the sum.
template <class Take> std::size_t TakeUnder(Sessions sessions, const std::string& name, const Take& take) {
    std::vector<std::pair<SettleSession*, MergeNames::ID>> meant;
    for (const auto& session : sessions) {
        const MergeNames::ID above = name.empty() ? nullptr : ObjectCalled(*session, name);
        if (name.empty() || above) meant.emplace_back(session.get(), above);
    }
    if (meant.empty() && !name.empty())
        throw Failure("No open conflict is about \"" + Printable(name) +
                      "\" or what stands under it, so nothing was decided: \"ovrin settle --list\" shows the "
                      "conflicts");
    std::size_t settled = 0;
    for (const auto& [session, above] : meant) {
        UnderObject under(session->Names(), above);
        settled += take(
            *session, [&, above = above](const OpenConflict& open) { return !above || under.IsMeant(open); });
    }
    return settled;
}

} // namespace

Wanted ParseWanted(const std::string& text) {
    const std::size_t sign = text.rfind('=');
    if (sign == std::string::npos || sign == 0)
        throw Failure("\"" + Printable(text) +
                      "\" is no decision: write PATH=ours, PATH=theirs or PATH=base");
    return {text.substr(0, sign), SideNamed(text.substr(sign + 1))};
}

void DecideWanted(Sessions sessions, std::span<const Wanted> wanted) {
    std::map<const SettleSession*, std::vector<Decision>> decisions; // only looked into
    for (const Wanted& one : wanted) {
        const std::vector<Meant> meant = FindMeant(sessions, one.what);
        if (meant.empty()) FailWithNothing(one.what);
        if (meant.size() > 1 && !IsPattern(one.what)) FailWithSeveral(one.what, meant);
        for (const Meant& place : meant) decisions[place.session].push_back({place.path, one.side});
    }
    for (const auto& session : sessions)
        if (const auto made = decisions.find(session.get()); made != decisions.end())
            MakeStep(*session, made->second, SettleSession::Follow::Yes);
}

void DecideByFile(Sessions sessions, const std::string& file) {
    if (sessions.size() != 1)
        throw Failure("A file of decisions is for one scene, and there are " +
                      std::to_string(sessions.size()) + ": name the one that is meant behind the options");
    // Nothing is added to it, so that the engine by itself would give the same.
    MakeStep(*sessions.front(), ReadDecisionFile(file), SettleSession::Follow::No);
}

std::size_t TakeSide(Sessions sessions, Side side, const std::string& under) {
    return TakeUnder(sessions, under, [side](SettleSession& session, const auto& isMeant) {
        return session.TakeAll(side, isMeant);
    });
}

std::size_t TakeProposed(Sessions sessions, const std::string& under) {
    const std::size_t settled = TakeUnder(sessions, under, [](SettleSession& session, const auto& isMeant) {
        return session.CountProposed() ? session.TakeProposed(isMeant) : 0;
    });
    if (!settled)
        throw Failure(
            "Nothing was decided before of the conflicts that are open: \"ovrin settle --list\" shows "
            "them");
    return settled;
}

} // namespace ovrin
