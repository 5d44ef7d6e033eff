#include "Preview/ScenePreview.h"

#include "Conflicts/ConflictReport.h"
#include "Conflicts/SceneMerge.h"
#include "Names/PrintableText.h"
#include "Scenes/SceneFile.h"
#include "Scenes/SceneRules.h"
#include "Words/Failure.h"

#include <algorithm>
#include <array>
#include <new>
#include <string_view>

namespace ovrin {

namespace {

constexpr std::size_t kMostReportedConflicts = 100; // of a scene; scripts are told all

Meeting MeetingOf(const UnmergedFile& file) {
    if (file.ours && file.theirs) return file.base ? Meeting::BothChanged : Meeting::BothAdded;
    if (file.base && file.ours) return Meeting::TheirsRemoved;
    if (file.base && file.theirs) return Meeting::OursRemoved;
    return Meeting::Misplaced;
}

bool HasConflict(const UnmergedFile& file, const char* name) {
    return std::ranges::find(file.conflicts, name) != file.conflicts.end();
}

std::string RemovalWords(const UnmergedFile& file, const NamedCommit& by, const NamedCommit& other) {
    return Printable(by.name) + " removed it, " + Printable(other.name) +
           (HasConflict(file, "rename/delete") ? " renamed it" : " changed it");
}

/// What people call the conflicts of git that come with names and folders. Others are told by git's name.
struct PlaceWords {
    const char* name;
    const char* words; // null: told by who removed it
};
constexpr std::array<PlaceWords, 8> kPlaceWords = {{
    {"modify/delete", nullptr},
    {"rename/delete", nullptr},
    {"rename/rename", "the sides renamed it differently"},
    {"rename involved in collision", "after renames two files have this name"},
    {"file/directory", "a folder of the other side has its name"},
    {"distinct modes", "one side made something else of it, such as a link"},
    {"distinct types", "one side made something else of it, such as a link"},
    {"directory rename suggested", "the other side renamed its folder, and git asks where it belongs"},
}};

std::string WordsOf(const std::string& conflict) {
    for (const PlaceWords& known : kPlaceWords)
        if (conflict == known.name) return known.words ? known.words : "";
    return "git leaves it unmerged (" + conflict + ")";
}

std::string ProblemOf(const UnmergedFile& file, Meeting meeting, const NamedCommit& ours,
                      const NamedCommit& theirs) {
    std::string problem;
    const auto add = [&](const std::string& words) {
        if (!words.empty() && problem.find(words) == std::string::npos)
            problem += (problem.empty() ? "" : "; ") + words;
    };
    if (meeting == Meeting::BothAdded) add("both sides added it");
    if (meeting == Meeting::OursRemoved) add(RemovalWords(file, ours, theirs));
    if (meeting == Meeting::TheirsRemoved) add(RemovalWords(file, theirs, ours));
    if (!file.pathInTheirs.empty())
        add(Printable(ours.name) + " gave it this name, " + Printable(theirs.name) + " renamed it to " +
            Printable(file.pathInTheirs));
    else
        for (const std::string& conflict : file.conflicts) add(WordsOf(conflict));
    if (problem.empty() && !IsMerged(file)) add("git leaves it unmerged");
    return problem;
}

/// Throws Failure for what isn't the text of a scene.
void CheckScene(const std::string& text, const std::string& name) {
    const SceneKind kind = ClassifyScene(text);
    if (kind != SceneKind::Scene) throw Failure(TellKind(name, kind));
}

void CheckScenes(const PreviewedScene& scene, const ThreeTexts& texts, const PreviewAnswer& question) {
    const std::string path = Printable(scene.path);
    CheckScene(texts.ours, path + " of " + Printable(question.ours.name));
    CheckScene(texts.theirs, path + " of " + Printable(question.theirs.name));
    if (!texts.base.empty()) CheckScene(texts.base, path + " of their common history");
}

} // namespace

PreviewedScene PlaceScene(const UnmergedFile& file, const NamedCommit& ours, const NamedCommit& theirs) {
    PreviewedScene scene;
    scene.path = file.path;
    scene.meeting = MeetingOf(file);
    scene.isByObjects = file.isByObjects;
    scene.gitConflicts = file.conflicts;
    scene.problem = ProblemOf(file, scene.meeting, ours, theirs);
    scene.verdict = scene.problem.empty() ? Verdict::Clean : Verdict::Conflicts;
    return scene;
}

bool IsMerged(const UnmergedFile& file) {
    return file.pathInTheirs.empty() && file.ours && file.theirs && file.ours->isFile &&
           file.theirs->isFile && (!file.base || file.base->isFile);
}

void MakeUnknown(PreviewedScene& scene, const std::string& why) {
    scene.verdict = Verdict::Unknown;
    scene.problem += (scene.problem.empty() ? "" : "; ") + why;
}

void LookInto(PreviewedScene& scene, const ThreeTexts& texts, const PreviewAnswer& question,
              const SceneRules& rules, ovrin_yaml::Threads threads) {
    try {
        CheckScenes(scene, texts, question);
        SceneMerge merge(texts, rules.rules, rules.types, threads);
        merge.Merge();
        if (merge.Open().empty()) return;
        scene.verdict = Verdict::Conflicts;
        scene.conflicts = ConflictsToJson(merge).at("conflicts");
        scene.report =
            TellConflicts(merge, {"", question.ours.name, question.theirs.name}, kMostReportedConflicts);
    } catch (const Failure& failure) {
        MakeUnknown(scene, failure.what());
    } catch (const std::bad_alloc&) {
        MakeUnknown(scene, "there is not enough memory to merge it");
    }
}

} // namespace ovrin
