#include "Systems/Git.h"

#include "FileUtils.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <cstdio>
#include <cstdlib>
#include <set>

namespace ovrin {

namespace {

std::vector<std::string> Lines(const std::string& text) {
    std::vector<std::string> lines;
    for (std::size_t from = 0; from < text.size();) {
        const std::size_t end = std::min(text.find('\n', from), text.size());
        lines.push_back(text.substr(from, end - from));
        from = end + 1;
    }
    return lines;
}

std::string FirstLine(const std::string& text) {
    return text.substr(0, text.find('\n'));
}

/// Runs git, whose status 1 is an answer as well, "no".
std::optional<std::string> Ask(const Repository& repository, const CommandWords& command) {
    const ProcessSetting setting = GitSetting(repository);
    ProcessResult result = RunProcess(command, setting);
    if (result.status == 1) return {};
    if (result.Succeeded()) return std::move(result.output);
    throw Failure("git can't work here: " + FirstLine(result.errors) + "\n" + result.errors);
}

/// The commits whose parents a shallow clone left out; none in a whole clone.
std::set<std::string> CutOffCommits(const Repository& repository) {
    const std::string path = FirstLine(OutputOf(
        {"git", "rev-parse", "--path-format=absolute", "--git-path", "shallow"}, GitSetting(repository)));
    std::string text;
    if (ReadWholeFile(path, text) != ReadResult::Complete) return {};
    const std::vector<std::string> lines = Lines(text);
    return {lines.begin(), lines.end()};
}

/// Whether a common ancestor may stand where the history was cut off. It may not if all that was cut off is
/// older than the common ancestors that are known.
bool IsDecisionCutOff(const Repository& repository, const std::vector<std::string>& sides,
                      const std::vector<std::string>& bases) {
    const std::set<std::string> cutOff = CutOffCommits(repository);
    if (cutOff.empty()) return false;
    CommandWords command = {"git", "rev-list"};
    command.insert(command.end(), sides.begin(), sides.end());
    for (const std::string& base : bases) command.push_back("^" + base);
    for (const std::string& commit : Lines(OutputOf(command, GitSetting(repository))))
        if (cutOff.contains(commit)) return true;
    return false;
}

} // namespace

GitVersion InstalledGit() {
    if (FindProgram("git").empty()) throw Failure("git is not installed, or not on the path");
    const std::string text = FirstLine(OutputOf({"git", "version"}));
    GitVersion version{};
    if (std::sscanf(text.c_str(), "git version %d.%d", &version.major, &version.minor) != 2)
        throw Failure("git doesn't tell its version, but \"" + text + "\"");
    return version;
}

ProcessSetting GitSetting(const Repository& repository) {
    ProcessSetting setting;
    setting.folder = repository.top.empty() ? repository.data : repository.top;
    // What it says may count from another folder.
    if (std::getenv("GIT_DIR")) setting.environment.emplace_back("GIT_DIR", repository.data);
    if (std::getenv("GIT_WORK_TREE")) setting.environment.emplace_back("GIT_WORK_TREE", repository.top);
    return setting;
}

std::optional<std::string> FindCommit(const Repository& repository, const std::string& revision) {
    const auto found = Ask(
        repository, {"git", "rev-parse", "--verify", "--quiet", "--end-of-options", revision + "^{commit}"});
    return found ? std::optional(FirstLine(*found)) : std::nullopt;
}

NamedCommit CheckedOut(const Repository& repository) {
    const auto commit = FindCommit(repository, "HEAD");
    const auto branch = Ask(repository, {"git", "symbolic-ref", "--quiet", "--short", "HEAD"});
    if (!commit) throw Failure("There is no commit here yet" + (branch ? " on " + FirstLine(*branch) : ""));
    constexpr std::size_t kShownDigits = 10;
    return {branch ? FirstLine(*branch) : commit->substr(0, kShownDigits), *commit};
}

std::vector<std::string> RevisionNames(const Repository& repository) {
    return Lines(OutputOf({"git", "for-each-ref", "--format=%(refname:short)"}, GitSetting(repository)));
}

std::vector<std::string> MergeBases(const Repository& repository, const NamedCommit& ours,
                                    const NamedCommit& theirs) {
    const auto found = Ask(repository, {"git", "merge-base", "--all", ours.id, theirs.id});
    std::vector<std::string> bases = found ? Lines(*found) : std::vector<std::string>();
    if (IsDecisionCutOff(repository, {ours.id, theirs.id}, bases))
        throw Failure("This clone is shallow: it lacks the history that says where " + ours.name + " and " +
                      theirs.name + " come from.\nGet it with \"git fetch --unshallow\"; a CI job that " +
                      "checks out with a depth needs the whole history, such as by \"fetch-depth: 0\"");
    return bases;
}

} // namespace ovrin
