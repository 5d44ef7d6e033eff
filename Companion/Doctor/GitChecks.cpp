#include "Doctor/GitChecks.h"

#include "Doctor/Patient.h"
#include "Doctor/SetupFix.h"
#include "Setup/GitPlaces.h"
#include "Setup/ProgramCall.h"
#include "Systems/Process.h"
#include "Words/Failure.h"

#include "FileUtils.h"

#include <algorithm>
#include <array>
#include <cstdio>
#include <unistd.h>

namespace ovrin {

namespace {

constexpr const char* kNoGit = "git is not installed";

bool HasGit() {
    return !FindProgram("git").empty();
}

std::string DriverIn(const std::string& scope) {
    CommandWords command = {"git", "config", "--get", "merge.ovrin.driver"};
    if (!scope.empty()) command.insert(command.begin() + 2, scope);
    return AnswerOf(command);
}

/// What is set in the repository wins, and is to be put right there.
bool IsSetLocally(const Patient& patient) {
    return patient.IsIn(SystemKind::Git) && !DriverIn("--local").empty();
}

std::string SetupAdvice(bool isLocal) {
    return isLocal ? "ovrin setup git --local" : "ovrin setup git";
}

/// The part of a driver that calls the program, as the shell is to read it; empty for another program's.
std::string CallIn(const std::string& driver) {
    std::string call = driver.substr(0, driver.find(" merge --base-label "));
    if (call.size() == driver.size()) return {};
    for (std::size_t at = 0; (at = call.find("%%", at)) != std::string::npos; ++at) call.erase(at, 1);
    return call;
}

/// The scenes that are there, or names that any scene could have.
std::vector<SceneLook> ScenesOrSamples(Patient& patient) {
    if (!patient.Scenes().empty()) return patient.Scenes();
    std::vector<SceneLook> samples;
    for (const char* name : {"a.ovrin", "a.prefab", "a.meta"})
        samples.push_back({name, {}, patient.AttributesOf(name)});
    return samples;
}

std::vector<const SceneLook*> ScenesOfMerge(const std::vector<SceneLook>& scenes, bool isOurs) {
    std::vector<const SceneLook*> found;
    for (const SceneLook& scene : scenes)
        if ((scene.attributes.at("merge") == "ovrin") == isOurs) found.push_back(&scene);
    return found;
}

/// git with its own folder of programs in front of the path, as it runs drivers and hooks.
bool GitFinds(const std::string& call, const std::string& path = {}) {
    ProcessSetting setting;
    if (!path.empty()) setting.environment.emplace_back("PATH", path);
    const std::string alias = "alias.ovrin-found=!command -v " + call + " >/dev/null";
    return RunProcess({FindProgram("git"), "-c", alias, "ovrin-found"}, setting).Succeeded();
}

std::string OriginOf(const std::string& origin) {
    constexpr std::string_view kFile = "file:";
    return origin.starts_with(kFile) ? origin.substr(kFile.size()) : std::string();
}

/// A line of an earlier version's set-up.
struct OldLine {
    std::string file, name, value;

    std::string Told() const { return file + " has " + name + " = " + value; }
};

/// Included files count by the line that includes them.
std::vector<OldLine> OldLines(const ProcessSetting& setting) {
    const std::vector<std::string> listed =
        ZeroEndedTexts(OutputOf({"git", "config", "--show-origin", "--null", "--list"}, setting));
    std::vector<OldLine> lines;
    for (std::size_t i = 0; i + 1 < listed.size(); i += 2) { // origin, name and value
        const std::size_t end = listed[i + 1].find('\n');
        if (end == std::string::npos) continue;
        const OldLine line = {OriginOf(listed[i]), listed[i + 1].substr(0, end),
                              listed[i + 1].substr(end + 1)};
        const bool isOldInclude =
            line.name == "include.path" && line.value.ends_with("/ovrinmerge/gitconfig");
        const bool isOldCall = line.value.find("ovrinmerge-vcs") != std::string::npos &&
                               !line.file.ends_with("/ovrinmerge/gitconfig");
        if (isOldInclude || isOldCall) lines.push_back(line);
    }
    return lines;
}

/// The command that takes the line out, and no other of that name.
CommandWords RemovalOf(const OldLine& line) {
    constexpr std::string_view kSpecial = ".[]{}()*+?^$|\\";
    std::string pattern;
    for (const char character : line.value) {
        if (kSpecial.find(character) != std::string_view::npos) pattern += '\\';
        pattern += character;
    }
    return {"git", "config", "--file", line.file, "--unset-all", line.name, '^' + pattern + '$'};
}

std::string RemoveAll(const std::vector<OldLine>& lines, const ProcessSetting& setting) {
    std::string words;
    for (const OldLine& line : lines) {
        OutputOf(RemovalOf(line), setting);
        words += (words.empty() ? "taken out: " : "; ") + line.Told();
    }
    return words;
}

std::string TextOf(const std::string& path) {
    std::string text;
    return ReadWholeFile(path, text) == ReadResult::Complete ? text : std::string();
}

/// Whether a hook calls the guard, by itself or through the framework that .pre-commit-config.yaml is for.
bool CallsGuard(const std::string& hook, const std::string& top) {
    const auto holds = [](const std::string& text, const char* words) {
        return text.find(words) != std::string::npos;
    };
    const std::string text = TextOf(hook);
    return holds(text, "ovrin status --guard") ||
           (holds(text, "pre-commit") && holds(TextOf(top + "/.pre-commit-config.yaml"), "ovrin-guard"));
}

} // namespace

Diagnosis LookAtGitVersion(Patient&) {
    if (!HasGit()) return {Health::Skipped, kNoGit};
    const std::string told = OutputOf({"git", "--version"});
    std::array<int, 2> version = {0, 0};
    if (std::sscanf(told.c_str(), "git version %d.%d", &version[0], &version[1]) != 2)
        throw Failure("\"git --version\" answers in a form that isn't known: " + told);
    const std::string name = std::to_string(version[0]) + '.' + std::to_string(version[1]);
    constexpr std::array<int, 2> kMergeTree = {2, 38}, kLabels = {2, 44};
    if (version < kMergeTree)
        return {Health::Problem,
                "git " + name + " can't merge beside the working tree, which \"ovrin preview\" needs",
                "install git 2.38 or later"};
    if (version < kLabels)
        return {Health::Note,
                "git " + name + " doesn't tell a driver what the sides are called, so it is guessed",
                "install git 2.44 or later"};
    return {Health::Fine, "git " + name + " can do all that is asked of it"};
}

Diagnosis LookAtGitDriver(Patient& patient) {
    if (!HasGit()) return {Health::Skipped, kNoGit};
    const bool isLocal = IsSetLocally(patient);
    const std::string driver = DriverIn({});
    if (!CallIn(driver).empty()) return {Health::Fine, "git knows the driver: " + driver};
    if (!driver.empty())
        return {Health::Problem, "git has another driver for scenes than set-up writes: " + driver,
                SetupAdvice(isLocal), FixBySetup("git", isLocal ? Scope::Local : Scope::Global)};
    if (!patient.IsIn(SystemKind::Git))
        return {Health::Note, "git is not set up to merge scenes", SetupAdvice(false)};
    const std::vector<SceneLook> scenes = ScenesOrSamples(patient);
    const bool isWanted = !ScenesOfMerge(scenes, true).empty();
    if (!isWanted && patient.Scenes().empty())
        return {Health::Note, "git is not set up to merge scenes, of which there are none here",
                SetupAdvice(false)};
    return {Health::Problem,
            isWanted
                ? "the attributes want scenes to be merged with the driver \"ovrin\", which is missing: git "
                  "merges them by lines and says nothing"
                : "git is not set up: it merges scenes by lines",
            SetupAdvice(false), FixBySetup("git", Scope::Global)};
}

Diagnosis LookAtGitAttributes(Patient& patient) {
    if (!HasGit()) return {Health::Skipped, kNoGit};
    if (!patient.IsIn(SystemKind::Git))
        return {Health::Skipped, "there is no git repository around this folder"};
    if (DriverIn({}).empty()) return {Health::Skipped, "there is no driver that attributes could name"};
    const std::vector<SceneLook> scenes = ScenesOrSamples(patient);
    const auto others = ScenesOfMerge(scenes, false);
    if (others.empty()) return {Health::Fine, "the attributes give all scenes to the driver"};
    const std::string merge = others.front()->attributes.at("merge");
    if (merge == "unspecified")
        return {Health::Problem,
                "no attributes give " + NameScenes(others) + " to the driver: git merges by lines",
                SetupAdvice(false), FixBySetup("git", Scope::Global)};
    return {
        Health::Problem,
        "the attributes have \"merge: " + merge + "\" for " + NameScenes(others) + ", not \"merge: ovrin\"",
        "change the line in .gitattributes, or \"ovrin setup git --local\" to overrule it for this clone"};
}

Diagnosis LookAtGitPath(Patient& patient) {
    if (!HasGit()) return {Health::Skipped, kNoGit};
    const bool isLocal = IsSetLocally(patient);
    std::string call = CallIn(DriverIn({}));
    if (call.empty()) call = CallOfThisProgram().ForShell();
    if (!GitFinds(call))
        return {Health::Problem, "git doesn't find " + call + ", the program that it is to call",
                SetupAdvice(isLocal), FixBySetup("git", isLocal ? Scope::Local : Scope::Global)};
    const bool isPath = call.find('/') != std::string::npos;
    if (!isPath && !GitFinds(call, "/usr/local/bin:/usr/bin:/bin"))
        return {Health::Note,
                "git finds " + call +
                    " on your path, but programs with windows that were started without it may not",
                SetupAdvice(false) + ", which writes the whole path"};
    return {Health::Fine, "git finds " + call};
}

Diagnosis LookAtGuard(Patient& patient) {
    if (!patient.IsIn(SystemKind::Git) || !HasGit())
        return {Health::Skipped, "there is no git repository around this folder"};
    const std::string hooks = GitHooks();
    const std::string hook = hooks.empty() ? "" : hooks + "/pre-commit";
    if (hook.empty()) return {Health::Skipped, "nobody commits in a repository without a working tree"};
    if (!CallsGuard(hook, patient.Around()->top))
        return {Health::Note, "nothing keeps unsettled scenes from being committed here",
                "ovrin setup git --local"};
    if (access(hook.c_str(), X_OK) != 0)
        return {Health::Problem, "git passes over the guard, since " + hook + " is not executable",
                "chmod +x " + ShellWord(hook)};
    return {Health::Fine, "a hook keeps unsettled scenes from being committed"};
}

Diagnosis LookAtOldSetup(Patient& patient) {
    if (!HasGit()) return {Health::Skipped, kNoGit};
    // git tells the file of a repository from there.
    const ProcessSetting setting = {.folder = patient.IsIn(SystemKind::Git) ? patient.Around()->top : ""};
    const std::vector<OldLine> lines = OldLines(setting);
    if (lines.empty()) return {Health::Fine, "no configuration of git names what earlier versions had"};
    const std::string more =
        lines.size() > 1 ? ", and " + std::to_string(lines.size() - 1) + " more are" : ", which is";
    std::string cure;
    for (const std::string& word : RemovalOf(lines.front()))
        cure += (cure.empty() ? "" : " ") + ShellWord(word);
    return {Health::Problem, lines.front().Told() + more + " of an earlier version", cure,
            [lines, setting] { return RemoveAll(lines, setting); }};
}

} // namespace ovrin
