#include "Session/MergeSession.h"

#include "Diff/YAMLMappingDiff.h"
#include "Merge/ConflictReport.h"
#include "Merge/DiffMerge.h"
#include "Repair/FileIDCollisions.h"
#include "Repair/ObjectTraits.h"
#include "Repair/PostProcess.h"
#include "Repair/PreProcess.h"
#include "Session/StageWatcher.h"

#include <cassert>
#include <exception>
#include <new>
#include <utility>

namespace ovrin_yaml {

namespace {

using Stage = MergeError::Stage;

/// Carries a stage out in which no single file is at fault.
template <class Step> void WithStage(Stage stage, const Step& step) {
    try {
        step();
    } catch (const YAMLError& error) {
        throw MergeError(stage, "", error, error.what());
    } catch (const std::bad_alloc&) {
        throw;
    } catch (const std::exception& error) {
        throw MergeError(stage, "", YAMLError(error.what()), error.what());
    }
}

void PreProcessFile(const std::string& name, OvrinObjects& objects, const TaskRunner& run) {
    try {
        PreProcess(objects.GetMapping(), run);
    } catch (const YAMLError& error) {
        throw MergeError(Stage::Prepare, name, error, "Cannot merge file '" + name + "': " + error.what());
    }
}

void MoveCollidingIDs(const YAMLMapping& base, const YAMLMapping& left, YAMLMapping& right,
                      const TaskRunner& run) {
    RemapCollidingAddFileIDs(CreateConflictingFileIDsRemapper(base, left, right), base, left, right, run);
}

const YAMLMappingDiff* DiffFiles(const MergeRules& rules, const OvrinObjects& base,
                                 const OvrinObjects& changed) {
    const YAMLMappingDiff* diff = nullptr;
    WithStage(Stage::Diff,
              [&] { diff = YAMLMappingDiff::Diff(rules, &base.GetMapping(), &changed.GetMapping()); });
    return diff;
}

/// A failure is told with the object at which the resolver stood.
const YAMLMappingDiff* MergeDiffs(const YAMLMappingDiff& left, const YAMLMappingDiff& right,
                                  ConflictResolver& resolver) {
    try {
        return MergeMappingDiffs(&left, &right, resolver);
    } catch (YAMLError& error) {
        const Path& path = resolver.m_Path.Elements();
        if (!path.empty()) error.SetPlace(path.front()->Value());
        throw;
    }
}

} // namespace

void MergeSession::SetRules(MergeRules rules, YAMLTypeInfoManager types) {
    m_Rules = std::move(rules);
    m_Types = std::move(types);
}

void MergeSession::Read(const std::vector<InputFile>& files, StageWatcher* watcher, ReaderOptions options) {
    static constexpr const char* kSteps[] = {"Read base", "Read left", "Read right"};
    OvrinObjects* const objects[] = {&m_Base, &m_Left, &m_Right};
    assert(files.size() == 2 || files.size() == 3);
    std::vector<FileReading> readings;
    for (std::size_t i = 0; i < files.size(); ++i) {
        m_Names.push_back(files[i].name);
        readings.push_back({kSteps[i], &files[i], objects[i]});
    }
    // The check of component dependencies looks into every object.
    if (m_Types.IsLoaded()) options.recognise = false;
    m_AreSmall = IsLittleWork(readings, m_Threads);
    ReadInputs(readings, m_Threads, watcher, options);
}

void MergeSession::Prepare() {
    OvrinObjects* const objects[] = {&m_Base, &m_Left, &m_Right};
    for (std::size_t i = 0; i < m_Names.size(); ++i) PreProcessFile(m_Names[i], *objects[i], m_Run);
    if (!HasRight()) return;
    WithStage(Stage::Prepare, [&] {
        MoveCollidingIDs(m_Base.GetMapping(), m_Left.GetMapping(), m_Right.GetMapping(), m_Run);
    });
}

void MergeSession::Diff(StageWatcher* watcher) {
    if (m_Threads != Threads::None && HasRight()) return DiffOnThreads(watcher);
    {
        const WatchedStep step(watcher, "Creating left diff");
        m_LeftDiff = DiffFiles(m_Rules, m_Base, m_Left);
    }
    if (!HasRight()) return;
    const WatchedStep step(watcher, "Creating right diff");
    m_RightDiff = DiffFiles(m_Rules, m_Base, m_Right);
}

void MergeSession::DiffOnThreads(StageWatcher* watcher) {
    // The size of a pipe isn't known.
    constexpr std::size_t kFewObjects = 1000;
    const bool isLittle = m_AreSmall && m_Base.GetMapping().Size() < kFewObjects;
    Thread left([this] { m_LeftDiff = DiffFiles(m_Rules, m_Base, m_Left); }, isLittle);
    Thread right([this] { m_RightDiff = DiffFiles(m_Rules, m_Base, m_Right); }, isLittle);
    {
        const WatchedStep step(watcher, "Waiting for left diff");
        left.Join();
        right.Join();
    }
    left.CheckForExceptions();
    right.CheckForExceptions();
}

void MergeSession::Decide(std::vector<RecordResolve> decisions, MergeResolve byDefault) {
    m_Decisions = std::move(decisions);
    m_ByDefault = byDefault;
}

void MergeSession::Merge() {
    m_Resolver.emplace(m_Rules, m_ByDefault);
    m_Resolver->SetResolveMethodForPaths(m_Decisions);
    WithStage(Stage::Merge, [&] { m_MergedDiff = MergeDiffs(*m_LeftDiff, *m_RightDiff, *m_Resolver); });
}

void MergeSession::Apply(Base base) {
    assert(m_Result != &m_Base && "the base is used up");
    if (base == Base::Kept) m_Copy.reset(m_Base.Clone());
    m_Result = base == Base::Kept ? m_Copy.get() : &m_Base;
    WithStage(Stage::Apply, [&] { m_MergedDiff->Apply(m_Result->GetMapping(), m_Run, InspectObject); });
}

RepairRoots MergeSession::RootsOf(OvrinObjects& merged) const {
    return {merged.GetMapping(), m_Left.GetMapping(), m_Right.GetMapping(), m_Run};
}

void MergeSession::Repair() {
    WithStage(Stage::Repair,
              [&] { m_HasBrokenDependencies = PostProcess(RootsOf(*m_Result), m_Types, *m_Resolver); });
}

std::unique_ptr<OvrinObjects> MergeSession::Premerge(MergeResolve resolve) {
    assert(m_Copy && "the base is kept");
    // Its objects are marked as shared already, so that cloning it again only reads them.
    std::unique_ptr<OvrinObjects> result(m_Base.Clone());
    YAMLMapping& root = result->GetMapping();
    RecordingConflictResolver resolver(m_Rules, resolve);
    const YAMLMappingDiff* merged = nullptr;
    WithStage(Stage::Merge, [&] { merged = MergeDiffs(*m_LeftDiff, *m_RightDiff, resolver); });
    WithStage(Stage::Apply, [&] { merged->Apply(root, m_Run, InspectObject); });
    WithStage(Stage::Repair, [&] { PostProcessMergeOnly(RootsOf(*result), resolver); });
    return result;
}

std::vector<const MergeSession::Record*> MergeSession::PendingConflicts() const {
    return PendingByPath(m_Resolver->Records());
}

} // namespace ovrin_yaml
