// A merge as version control asks for it. The order of its steps loses nothing at any end of the process:
//
//  1. The inputs are read, one of which may be the result.
//  2. Where nothing is open, a record of an earlier merge of the scene goes, and then the result comes.
//  3. Where something is open, the record is written first, and then the result. Until the exit status,
//     which leaves the scene unmerged whatever it is, only 0 would say otherwise; a record without its result
//     is settled like any other.

#include "Commands/FileMerge.h"

#include "Commands/Output.h"
#include "Conflicts/ConflictReport.h"
#include "Conflicts/OpenMerges.h"
#include "Conflicts/SceneMerge.h"
#include "Conflicts/TakeSetting.h"
#include "Names/PrintableText.h"
#include "Scenes/SceneFile.h"
#include "Settle/SettleScenes.h"
#include "Systems/Caller.h"
#include "Systems/LineMerge.h"
#include "Systems/Repository.h"
#include "Systems/WorkingPath.h"
#include "Words/Failure.h"
#include "Words/ProgressLine.h"
#include "Words/WriteFailure.h"

#include "Destination.h"
#include "FileUtils.h"

#include <cerrno>
#include <filesystem>
#include <future>
#include <memory>
#include <system_error>

namespace ovrin {

namespace {

namespace fs = std::filesystem;

constexpr std::size_t kMostTold = 20; // conflicts of a scene

std::string ReadSide(const char* side, const std::string& file) {
    std::string text;
    if (ReadWholeFile(file, text) != ReadResult::Complete)
        throw Failure("cannot read " + std::string(side) + ", " + Printable(file) + ": " +
                      std::system_category().message(errno));
    return text;
}

ThreeTexts ReadTexts(const FileMerge& files) {
    return {ReadSide("base", files.base), ReadSide("ours", files.ours), ReadSide("theirs", files.theirs)};
}

/// Throws Failure for the first text that is no scene. A base may be empty: there is none, then.
void CheckKinds(const ThreeTexts& texts) {
    const auto check = [](const char* side, const std::string& text, bool mayBeEmpty) {
        const SceneKind kind = ClassifyScene(text);
        const bool isFine = kind == SceneKind::Scene || (kind == SceneKind::Empty && mayBeEmpty);
        if (!isFine) throw Failure(TellKind(side, kind));
    };
    check("ours", texts.ours, false);
    check("theirs", texts.theirs, false);
    check("base", texts.base, true);
}

/// Whether the engine might take a text for a scene that is none: it reads nothing behind a NUL.
bool IsSuspicious(const std::string& text) {
    return text.empty() || text.find('\0') != std::string::npos;
}

/// Files of other programs may have names as scenes have them, and set-up is for all repositories of a user.
bool IsNobodysScene(const ThreeTexts& texts) {
    const auto isText = [](const std::string& text) { return ClassifyScene(text) == SceneKind::NoScene; };
    return isText(texts.ours) && isText(texts.theirs) && (texts.base.empty() || isText(texts.base));
}

/// Reads and compares; null where no version is a scene. What the engine refuses may be no scene at all,
/// which is said better in other words; to look for all that beforehand would take a tenth of the whole time.
std::unique_ptr<SceneMerge> Compare(const FileMerge& files, ovrin_yaml::StageWatcher& watcher) {
    SceneRules rules = ReadSceneRules(files.format);
    ThreeTexts texts = ReadTexts(files);
    if (IsSuspicious(texts.base) || IsSuspicious(texts.ours) || IsSuspicious(texts.theirs)) CheckKinds(texts);
    try {
        return std::make_unique<SceneMerge>(std::move(texts), std::move(rules.rules), std::move(rules.types),
                                            ovrin_yaml::Threads::WhereWorthwhile, &watcher);
    } catch (const Failure&) {
        const ThreeTexts again = ReadTexts(files);
        if (IsNobodysScene(again)) return nullptr;
        CheckKinds(again);
        throw;
    }
}

/// Whether the file is git's own copy of ours, which it removes as soon as it has read the result there.
bool IsPassing(const std::string& file) {
    return fs::path(file).filename().string().starts_with(".merge_file_");
}

void DeliverResult(const std::string& file, const std::string& text) {
    // Version control doesn't sync the files of a merge either, and would have to start again without them.
    const Content content = {text.size(), [&](OutputStream& stream) { stream << text; },
                             IsPassing(file) ? Durability::Passing : Durability::Unsynced};
    if (const int error = Deliver(file, content))
        throw WriteFailure("cannot write the result, " + Printable(file) + ": " +
                           std::system_category().message(error));
}

/// As version control would have done it if the file had another name.
Outcome MergeByLines(const FileMerge& files) {
    const auto merged = MergeLines(files.base, files.ours, files.theirs);
    if (!merged) throw Failure(TellKind("ours", SceneKind::NoScene));
    DeliverResult(files.result, merged->text);
    Tell("ovrin: " + Printable(files.path) + " is no scene in any version, and was merged by lines" +
         (merged->conflicts > 0 ? ": conflicts stand between markers\n" : "\n"));
    return merged->conflicts > 0 ? Outcome::LeftOpen : Outcome::Done;
}

/// The repository that a scene belongs to. Its folder may not be there yet, in the midst of a merge.
std::optional<Repository> RepositoryOf(const std::string& path) {
    const fs::path folder = fs::path(path).parent_path();
    std::error_code error;
    return FindRepository(fs::is_directory(folder, error) ? folder.string() : ".");
}

/// Where open merges of the scene are written down; nothing where no working tree is merged.
struct Records {
    explicit Records(const std::string& scenePath) : repository(RepositoryOf(scenePath)) {
        if (repository && !repository->top.empty()) path = WorkingPath(*repository, scenePath);
    }

    const std::optional<Repository> repository;
    std::string path; ///< empty: nowhere
};

/// What was decided in a record that goes is proposed where it is met again.
void RememberEarlier(const Records& records) {
    try {
        RememberDecisions(*records.repository, records.path);
    } catch (const std::exception& error) {
        Tell("ovrin: what was decided of " + Printable(records.path) +
             " before can't be proposed again: " + error.what() + "\n");
    }
}

/// Most often no merge is open, and there is nothing to ask for.
void ForgetEarlier(const Records& records) {
    if (records.path.empty()) return;
    OpenMerges merges(*records.repository);
    if (!merges.Has(records.path) || IsWithoutTree(FindCaller())) return;
    RememberEarlier(records);
    merges.Remove(records.path);
}

/// What is told of an open merge that can't be written down.
std::string Record(const Records& records, const FileMerge& files, OpenMerge merge) {
    if (records.path.empty()) return "Nothing is written down: there is no working tree around the file.\n";
    try {
        merge.texts = ReadTexts(files); // as they still are: the result comes later
        merge.rules = files.format.LastingRules();
        merge.typeInfo = files.format.LastingTypeInfo();
        RememberEarlier(records);
        OpenMerges(*records.repository).Add(merge);
        return {};
    } catch (const std::exception& error) {
        return std::string("The merge could not be written down: ") + error.what() +
               "\nNothing is lost: version control keeps all three versions until the file is settled, and "
               "with git \"ovrin settle\" merges them again.\n";
    }
}

/// The merge as it is to be told and written down, without its texts and the side that is taken.
OpenMerge DescribeOpen(const FileMerge& files, const Records& records, const std::optional<Caller>& caller,
                       const SceneMerge& merge) {
    OpenMerge open;
    open.path = records.path.empty() ? files.path : records.path;
    open.occasion = FindOccasion(records.repository, caller, files.labels);
    if (caller) open.process = caller->process;
    open.isBothAdded = merge.IsBothAdded();
    open.conflicts = merge.Open().size();
    return open;
}

std::string TellOpen(SceneMerge& merge, const OpenMerge& open) {
    std::string text = "ovrin: " + Printable(open.path) + ": " + CountOpen(open.conflicts);
    if (open.conflicts) text += std::string(", where the file has ") + SideName(open.take) + " for now";
    text += '\n';
    if (open.isBothAdded)
        text += "Both sides added the file, so that nothing tells what one of them removed: the file has all "
                "that either has, and wants to be looked through.\n";
    return text + TellSides(open.occasion) + TellConflicts(merge, SideLabels::Of(open.occasion), kMostTold);
}

constexpr const char* kNextStep =
    "Next: \"ovrin settle\" settles the open conflicts of all scenes, \"ovrin settle --web\" does so in the "
    "browser; \"ovrin settle --take theirs\" takes a side at all of them.\n";

/// Once for all scenes that version control merges at one go, ahead of its record.
std::string TellNext(const Records& records, const OpenMerge& open) {
    const bool isTold = !records.path.empty() && OpenMerges(*records.repository).HasFellowOf(open);
    return isTold ? "" : kNextStep;
}

Outcome LeaveOpen(const FileMerge& files, const Records& records, SceneMerge& merge, ProgressLine& progress) {
    // Version control takes its time for the answer, which most often is ours.
    std::future<Side> take = std::async([&] { return SideToTake(records.repository); });
    const std::optional<Caller> caller = FindCaller();
    const bool isRecorded = !IsWithoutTree(caller);
    OpenMerge open = DescribeOpen(files, records, caller, merge);
    std::string result = merge.Result();
    open.take = take.get();
    if (open.take != Side::Ours) {
        merge.Merge({}, open.take);
        result = merge.Result();
    }
    std::string behind = isRecorded ? TellNext(records, open) : "";
    if (isRecorded) behind.insert(0, Record(records, files, open));
    DeliverResult(files.result, result);
    const std::string told = TellOpen(merge, open) + behind;
    progress.Wipe();
    Tell(told);
    return Outcome::LeftOpen;
}

} // namespace

Outcome Merge(const FileMerge& files) {
    ProgressLine progress(Printable(files.path));
    const std::unique_ptr<SceneMerge> compared = Compare(files, progress);
    if (!compared) return MergeByLines(files);
    SceneMerge& merge = *compared;
    merge.Merge();
    const Records records(files.path);
    if (!merge.Open().empty() || merge.IsBothAdded()) return LeaveOpen(files, records, merge, progress);
    const std::string result = merge.Result();
    ForgetEarlier(records);
    DeliverResult(files.result, result);
    return Outcome::Done;
}

} // namespace ovrin
