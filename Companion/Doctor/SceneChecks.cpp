#include "Doctor/SceneChecks.h"

#include "Conflicts/LiveMerges.h"
#include "Conflicts/OpenMerges.h"
#include "Doctor/Patient.h"
#include "Doctor/SetupFix.h"
#include "Names/PrintableText.h"
#include "Scenes/SceneFile.h"
#include "Systems/Git.h"

#include "Writing/ObjectFileWriter.h"
#include "Writing/WrittenForm.h"

#include <algorithm>

namespace ovrin {

namespace {

constexpr const char* kNoRepository = "there is no repository around this folder";

template <class Condition>
std::vector<const SceneLook*> ScenesThat(Patient& patient, const Condition& condition) {
    std::vector<const SceneLook*> found;
    for (const SceneLook& scene : patient.Scenes())
        if (condition(scene)) found.push_back(&scene);
    return found;
}

std::string AttributeOf(const SceneLook& scene, const char* name) {
    const auto found = scene.attributes.find(name);
    return found == scene.attributes.end() ? "unspecified" : found->second;
}

/// What git's configuration says of line ends.
struct LineEndConfig {
    bool convertsAll; ///< core.autocrlf, which also reaches files without attributes
    bool writesLong;  ///< text files get "\r\n" in the working tree

    bool Converts(const SceneLook& scene) const {
        const std::string text = AttributeOf(scene, "text"), eol = AttributeOf(scene, "eol");
        if (text == "unset") return false;
        if (eol == "crlf") return true;
        if (text == "unspecified") return convertsAll;
        return writesLong && eol != "lf";
    }
};

LineEndConfig ReadLineEndConfig(const Repository& repository) {
    const Git git(repository);
    const std::string autocrlf = git.ConfigValue("core.autocrlf").value_or("");
    const bool isAlways = autocrlf == "true" || autocrlf == "1" || autocrlf == "yes" || autocrlf == "on";
    return {isAlways || autocrlf == "input", isAlways || git.ConfigValue("core.eol") == "crlf"};
}

/// The domain name in the second line of a scene; empty for a header of another form.
std::string AuthorityOf(const SceneLook& scene) {
    if (!scene.start.starts_with(ovrin_yaml::kFileHeaderStart)) return {};
    const std::size_t begin = ovrin_yaml::kFileHeaderStart.size();
    const std::size_t end = scene.start.find_first_of(",\r\n", begin);
    return end == std::string::npos ? "" : scene.start.substr(begin, end - begin);
}

bool HasLongLineEnds(const SceneLook& scene) {
    const std::size_t end = scene.start.find('\n');
    return end != std::string::npos && end > 0 && scene.start[end - 1] == '\r';
}

} // namespace

Diagnosis LookAtLineEnds(Patient& patient) {
    if (!patient.Around()) return {Health::Skipped, kNoRepository};
    if (patient.IsIn(SystemKind::Git)) {
        const LineEndConfig config = ReadLineEndConfig(*patient.Around());
        const auto converted =
            ScenesThat(patient, [&](const SceneLook& scene) { return config.Converts(scene); });
        if (!converted.empty()) {
            Diagnosis diagnosis = {
                Health::Problem, "git changes the line ends of " + NameScenes(converted),
                "add -text to the lines of scenes in .gitattributes, such as \"*.prefab -text\""};
            if (AttributeOf(*converted.front(), "text") == "unspecified") {
                diagnosis.cure += ", or \"ovrin setup git\" for all repositories";
                diagnosis.fix = FixBySetup("git", Scope::Global);
            }
            return diagnosis;
        }
    }
    const auto changed = ScenesThat(patient, HasLongLineEnds);
    if (!changed.empty())
        return {Health::Problem, NameScenes(changed) + " has \"\\r\\n\" at the ends of its lines",
                "let the editor save it again"};
    return {Health::Fine, "nothing changes the line ends of scenes"};
}

Diagnosis LookAtLfs(Patient& patient) {
    if (!patient.Around()) return {Health::Skipped, kNoRepository};
    const auto tracked = ScenesThat(patient, [](const SceneLook& scene) {
        return AttributeOf(scene, "filter") == "lfs" || ClassifyScene(scene.start) == SceneKind::LfsPointer;
    });
    if (tracked.empty()) return {Health::Fine, "no scene is kept by Git LFS"};
    return {
        Health::Problem, "Git LFS keeps " + NameScenes(tracked) + ": merges see pointers, and no scene",
        "take the lines of scenes out of those of LFS in .gitattributes, then \"git add --renormalize .\""};
}

Diagnosis LookAtTagAuthority(Patient& patient) {
    if (!patient.Around()) return {Health::Skipped, kNoRepository};
    const std::string ours(ovrin_yaml::TagAuthority());
    const auto others = ScenesThat(patient, [&](const SceneLook& scene) {
        const std::string authority = AuthorityOf(scene);
        return !authority.empty() && authority != ours;
    });
    if (others.empty()) return {Health::Fine, "all scenes have the tag authority of this build, " + ours};
    const std::string authority = Printable(AuthorityOf(*others.front()));
    return {Health::Problem,
            "the second line of " + NameScenes(others) + " names " + authority + ", but this build writes " +
                ours,
            "use a build for your editor, by cmake -DOVRIN_TAG_AUTHORITY=" + authority};
}

Diagnosis LookAtOpenConflicts(Patient& patient) {
    if (!patient.Around()) return {Health::Skipped, kNoRepository};
    const OpenMerges store(*patient.Around());
    const LiveMerges merges = FindLiveMerges(*patient.Around(), store);
    const std::size_t count = merges.live.size() + merges.unrecorded.size();
    if (count > 0) {
        const std::string first = merges.live.empty() ? merges.unrecorded.front() : merges.live.front().path;
        const std::string more = count > 1 ? " and of " + std::to_string(count - 1) + " more scenes" : "";
        return {Health::Problem, "the merge of " + Printable(first) + more + " waits for a person",
                "\"ovrin status\" tells what is open, \"ovrin settle\" settles it"};
    }
    if (merges.stale.empty()) return {Health::Fine, "no merge of a scene waits for a person"};
    return {Health::Problem,
            "notes of " + std::to_string(merges.stale.size()) + " merges are left that are over",
            "ovrin doctor --fix", [&patient, stale = merges.stale] {
                OpenMerges notes(*patient.Around());
                for (const OpenMerge& merge : stale) notes.Remove(merge.path);
                return std::to_string(stale.size()) + " notes were removed";
            }};
}

} // namespace ovrin
