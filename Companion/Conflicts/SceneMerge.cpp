#include "Conflicts/SceneMerge.h"

#include "Conflicts/DecisionPath.h"
#include "Scenes/SceneFile.h"
#include "Words/Failure.h"

#include "Session/StageWatcher.h"
#include "Writing/ObjectFileWriter.h"

#include <algorithm>
#include <new>
#include <set>
#include <sstream>
#include <utility>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

const char* VerbOf(MergeError::Stage stage) {
    switch (stage) {
    case MergeError::Stage::Read:
        return "read";
    case MergeError::Stage::Prepare:
        return "made ready for merging";
    case MergeError::Stage::Diff:
        return "compared";
    default:
        return "merged";
    }
}

std::string Tell(const MergeError& error) {
    std::string text = (error.file.empty() ? "The scene" : error.file) + " can't be " + VerbOf(error.stage);
    if (!error.Object().empty()) text += ", at object " + error.Object();
    if (error.Line()) text += ", line " + std::to_string(error.Line());
    text += ": " + error.reason;
    return error.stage == MergeError::Stage::Read ? text + kCureOfUnreadable : text;
}

/// Carries out a step of the engine. What it throws becomes a Failure.
template <class Step> void WithFailures(const Step& step) {
    try {
        step();
    } catch (const MergeError& error) {
        throw Failure(Tell(error));
    } catch (const YAMLError& error) {
        throw Failure("The scene can't be merged: " + error.what());
    } catch (const YAMLError* error) { // a loop of objects that are no Transforms
        throw Failure("The scene can't be merged: " + error->what());
    }
}

/// An object file of the same header without objects.
std::string WithoutObjects(const std::string& text) {
    constexpr std::string_view kObject = "--- ";
    if (text.starts_with(kObject)) return {};
    const std::size_t end = text.find("\n" + std::string(kObject));
    return end == std::string::npos ? text : text.substr(0, end + 1);
}

/// A text that stays where it is until a thread takes it.
InputFile Input(const char* name, std::string& text) {
    return {name, text.size(), [&text] { return std::move(text); }};
}

MergeResolve ResolveOf(Side side) {
    return side == Side::Ours ? ResolveRight : side == Side::Theirs ? ResolveLeft : ResolveBase;
}

std::vector<RecordResolve> ResolvesOf(std::span<const Decision> decisions) {
    std::vector<RecordResolve> resolves;
    for (const Decision& decision : decisions)
        resolves.push_back({PathOfDecision(decision.path), ResolveOf(decision.side)});
    return resolves;
}

/// Of an open loop the path at which sides can be decided on. The record's own leads to the id within the
/// reference; where one side alone changed that, the merge doesn't go so far down.
Path ParentPath(const MergeSession::Record& record) {
    Path path = record.path.Elements();
    path.pop_back();
    return path;
}

bool IsOpenLoop(const MergeSession::Record& record) {
    return record.type == ConflictTransformCycle && record.resolve == ResolveConflict;
}

ConflictKind KindOf(const MergeSession::Record& record) {
    if (record.path.Elements().front() == YAMLScalar::underscore) return ConflictKind::KeyOrder;
    switch (record.type) {
    case ConflictBothAdds:
        return ConflictKind::BothAdded;
    case ConflictRemoveAgainstChange:
        return ConflictKind::TheirsRemoved;
    case ConflictTransformCycle:
        return ConflictKind::ParentLoop;
    case ConflictLeftRemoves:
    case ConflictRightRemoves:
    case ConflictBothRemoves:
        return ConflictKind::BrokenRequirement;
    default:
        return ConflictKind::BothChanged;
    }
}

/// Those of `decisions`, which are those of the table, that match no record.
std::vector<Decision> FindUnmatched(std::span<const Decision> decisions, const ResolveTable& table,
                                    std::span<const MergeSession::Record> records) {
    if (decisions.empty()) return {};
    std::vector<bool> isFound(decisions.size());
    for (const MergeSession::Record& record : records)
        table.ForEachMatch(record.path.Elements(), [&](std::size_t number) { isFound[number] = true; });
    std::set<Path> found;
    for (std::size_t i = 0; i < decisions.size(); ++i)
        if (isFound[i]) found.insert(table.All()[i].path);
    std::vector<Decision> unmatched;
    for (std::size_t i = 0; i < decisions.size(); ++i)
        if (!found.contains(table.All()[i].path)) unmatched.push_back(decisions[i]);
    return unmatched;
}

} // namespace

SceneMerge::SceneMerge(ThreeTexts texts, MergeRules rules, YAMLTypeInfoManager types, Threads threads,
                       StageWatcher* watcher)
    : m_IsBothAdded(texts.base.empty()), m_Watcher(watcher), m_Session(threads) {
    if (m_IsBothAdded) texts.base = WithoutObjects(texts.ours);
    m_Session.SetRules(std::move(rules), std::move(types));
    WithFailures([&] {
        m_Session.Read({Input("base", texts.base), Input("theirs", texts.theirs), Input("ours", texts.ours)},
                       watcher);
        m_Session.Prepare();
        m_Session.Diff(watcher);
    });
}

void SceneMerge::Merge(std::span<const Decision> decisions, Side take) {
    const std::vector<RecordResolve> resolves = ResolvesOf(decisions);
    RunMerge(resolves, take);
    ResolveTable decided;
    decided.Set(resolves);
    CollectOpen(decided);
    m_Unmatched = FindUnmatched(decisions, decided, m_Session.Resolver().Records());
    BreakLoops(resolves, take);
}

void SceneMerge::RunMerge(const std::vector<RecordResolve>& decisions, Side take) {
    const WatchedStep step(m_Watcher, "Merging");
    WithFailures([&] {
        m_Session.Decide(decisions, ResolveOf(take));
        m_Session.Merge();
        m_Session.Apply();
        m_Session.Repair();
    });
}

void SceneMerge::CollectOpen(const ResolveTable& decided) {
    m_Open.clear();
    for (const MergeSession::Record* pending : m_Session.PendingConflicts()) {
        MergeSession::Record record = *pending;
        if (IsOpenLoop(record)) record.path = WalkedPath(ParentPath(record)).Keep();
        Path path = record.path.Elements();
        const ConflictKind kind = KindOf(record);
        // What was decided on and is pending again breaks a requirement, and that is what the decision says.
        if (path.size() == 1 && decided.Find(path)) continue;
        if (!m_Open.empty() && m_Open.back().path == path) continue;
        m_Open.push_back({std::move(path), kind, record});
    }
}

/// A scene with a loop of parents can't be opened. What `take` has there usually ends it; if not, the objects
/// come to stand at the top.
void SceneMerge::BreakLoops(std::vector<RecordResolve> decisions, Side take) {
    const auto decideLoops = [&](const auto& pathOf, MergeResolve resolve) {
        const std::size_t before = decisions.size();
        for (const MergeSession::Record& record : m_Session.Resolver().Records())
            if (IsOpenLoop(record)) decisions.insert(decisions.begin(), {pathOf(record), resolve});
        if (decisions.size() > before) RunMerge(decisions, take);
    };
    decideLoops(ParentPath, ResolveOf(take));
    decideLoops([](const MergeSession::Record& record) { return record.path.Elements(); }, ResolveBreakCycle);
}

std::string SceneMerge::Result() const {
    std::ostringstream stream;
    // A stream keeps to itself that memory is lacking, unless it is told not to.
    stream.exceptions(std::ios_base::badbit);
    WithFailures([&] { Output(m_Session.Result(), stream); });
    return std::move(stream).str();
}

} // namespace ovrin
