#include "MergeRun.h"

#include "TraitsCheck.h"
#include "TreeComparison.h"

#include "Diff/CheckDiff.h"
#include "Merge/ConflictReport.h"
#include "Session/MergeSession.h"
#include "Writing/CheckTree.h"
#include "Writing/ObjectFileWriter.h"

#include <exception>
#include <sstream>

using namespace ovrin_yaml;

namespace ovrin_fuzz {

namespace {

template <class Write> std::string Written(const Write& write) {
    std::ostringstream stream;
    write(stream);
    return stream.str();
}

/// What a broken invariant is told by.
class BrokenTree final : public std::exception {
public:
    explicit BrokenTree(std::string fault) : m_Fault(std::move(fault)) {}
    const char* what() const noexcept override { return m_Fault.c_str(); }

private:
    std::string m_Fault;
};

void Check(const char* when, const OvrinObjects& objects, TreeStage stage) {
    std::string fault = CheckTree(objects.GetMapping(), stage);
    if (fault.empty()) fault = CheckTraits(objects.GetMapping());
    if (!fault.empty()) throw BrokenTree(std::string(when) + ": " + fault);
}

void CheckFiles(const char* when, MergeSession& session, TreeStage baseStage) {
    Check(when, session.BaseObjects(), baseStage);
    Check(when, session.LeftObjects(), TreeStage::Hashed);
    Check(when, session.RightObjects(), TreeStage::Hashed);
}

/// After a stage, where stages are checked.
class StageCheck {
public:
    explicit StageCheck(const MergeWay& way) : m_IsOn(way.checksStages) {}

    void Files(const char* stage, MergeSession& session, TreeStage baseStage = TreeStage::Hashed) const {
        if (m_IsOn) CheckFiles(stage, session, baseStage);
    }
    void Result(const char* stage, const OvrinObjects& result) const {
        if (m_IsOn) Check(stage, result, TreeStage::Changed);
    }

private:
    const bool m_IsOn;
};

void CheckDiff(const char* which, const YAMLMappingDiff& diff, DiffOrigin origin) {
    const std::string fault = CheckDiff(diff, origin);
    if (!fault.empty()) throw BrokenTree(std::string(which) + " diff: " + fault);
}

/// All that comes before the merge itself.
std::shared_ptr<MergeSession> Prepare(const MergeWay& way) {
    auto session = std::make_shared<MergeSession>(way.threads);
    session->SetRules(way.rules);
    session->Read(way.files(), nullptr, way.options);
    StageCheck(way).Files("read", *session);
    session->Prepare();
    StageCheck(way).Files("prepared", *session);
    session->Diff();
    CheckDiff("left", session->LeftDiff(), DiffOrigin::Trees);
    CheckDiff("right", session->RightDiff(), DiffOrigin::Trees);
    return session;
}

void Merge(MergeSession& session, MergeResolve resolve, MergeSession::Base base, const StageCheck& check) {
    session.Decide({}, resolve);
    session.Merge();
    CheckDiff("merged", session.MergedDiff(), DiffOrigin::Sides);
    check.Files("merged", session);
    const TreeStage baseStage = base == MergeSession::Base::Kept ? TreeStage::Hashed : TreeStage::Changed;
    session.Apply(base);
    check.Result("applied", session.Result());
    check.Files("applied", session, baseStage);
    session.Repair();
    check.Result("repaired", session.Result());
    check.Files("repaired", session, baseStage);
}

std::string Written(const OvrinObjects& objects) {
    return Written([&](std::ostream& stream) { Output(objects, stream); });
}

void TakeResult(const MergeSession& session, MergeOutcome& outcome) {
    outcome.report =
        Written([&](std::ostream& stream) { OutputConflictRecords(stream, session.Resolver(), true); }) +
        (session.HasBrokenDependencies() ? "broken dependencies" : "");
    outcome.result = Written(session.Result());
}

constexpr MergeResolve kPremerges[] = {ResolveBlank, ResolveRight};

/// One session for everything. An earlier merge of it, which may fail, leaves no trace.
void MergeInOneSession(const MergeWay& way, MergeOutcome& outcome) {
    const StageCheck check(way);
    MergeSession& session = *(outcome.session = Prepare(way));
    try {
        Merge(session, ResolveRight, MergeSession::Base::Kept, check);
    } catch (const MergeError&) {
    }
    Merge(session, ResolveBase, MergeSession::Base::Kept, check);
    TakeResult(session, outcome);
    for (std::size_t i = 0; i < std::size(kPremerges); ++i) {
        const std::unique_ptr<OvrinObjects> premerged = session.Premerge(kPremerges[i]);
        check.Result("premerged", *premerged);
        outcome.premerged[i] = Written(*premerged);
    }
    CheckFiles("premerged", session, TreeStage::Hashed);
}

/// A session for each result, which is built in its base.
void MergeInSessions(const MergeWay& way, MergeOutcome& outcome) {
    outcome.session = Prepare(way);
    const StageCheck check(way);
    Merge(*outcome.session, ResolveBase, MergeSession::Base::UsedUp, check);
    TakeResult(*outcome.session, outcome);
    for (std::size_t i = 0; i < std::size(kPremerges); ++i) {
        const std::shared_ptr<MergeSession> session = Prepare(way);
        Merge(*session, kPremerges[i], MergeSession::Base::UsedUp, check);
        outcome.premerged[i] = Written(session->Result());
    }
}

} // namespace

MergeOutcome RunMerge(const MergeWay& way) {
    MergeOutcome outcome;
    outcome.failure = "none";
    try {
        (way.sessions == Sessions::One ? MergeInOneSession : MergeInSessions)(way, outcome);
    } catch (const YAMLError& error) {
        outcome.failure = error.what() + ", at " + error.Object() + ":" + std::to_string(error.Line());
    } catch (const YAMLError* error) { // of a cycle that can't be broken
        outcome.failure = "cycle: " + error->what();
    } catch (const BrokenTree& fault) {
        outcome.brokenTree = fault.what();
    } catch (const std::exception& error) {
        outcome.failure = std::string("exception: ") + error.what();
    }
    return outcome;
}

std::string CompareOutcomes(const MergeOutcome& expected, const MergeOutcome& actual) {
    if (!actual.brokenTree.empty()) return actual.brokenTree;
    if (!expected.brokenTree.empty()) return expected.brokenTree;
    const auto compare = [](const char* what, const std::string& left, const std::string& right) {
        return left == right ? "" : std::string(what) + ":\n" + left + "\nand\n" + right + "\n";
    };
    std::string difference = compare("failure", expected.failure, actual.failure) +
                             compare("report", expected.report, actual.report) +
                             compare("result", expected.result, actual.result) +
                             compare("premerged with blanks", expected.premerged[0], actual.premerged[0]) +
                             compare("premerged right", expected.premerged[1], actual.premerged[1]);
    if (!difference.empty() || expected.failure != "none") return difference;
    MergeSession &one = *expected.session, &other = *actual.session;
    difference = FirstDifference(one.Result().GetMapping(), other.Result().GetMapping()) +
                 FirstDifference(one.LeftObjects().GetMapping(), other.LeftObjects().GetMapping()) +
                 FirstDifference(one.RightObjects().GetMapping(), other.RightObjects().GetMapping());
    return difference.empty() ? "" : "trees after the merge:" + difference;
}

} // namespace ovrin_fuzz
