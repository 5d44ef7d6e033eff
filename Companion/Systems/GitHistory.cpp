#include "Systems/GitHistory.h"

#include "FileUtils.h"
#include "Systems/Git.h"
#include "Systems/Process.h"
#include "Words/Failure.h"

#include <cstdio>
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
std::optional<std::string> Ask(const Git& git, const CommandWords& arguments) {
    ProcessResult result = git.Run(arguments);
    if (result.status == 1) return {};
    if (result.Succeeded()) return std::move(result.output);
    throw Failure("git can't work here:\n" + result.errors);
}

/// The commits whose parents a shallow clone left out; none in a whole clone.
std::set<std::string> CutOffCommits(const Git& git) {
    const std::string path =
        FirstLine(git.Output({"rev-parse", "--path-format=absolute", "--git-path", "shallow"}));
    std::string text;
    if (ReadWholeFile(path, text) != ReadResult::Complete) return {};
    const std::vector<std::string> lines = Lines(text);
    return {lines.begin(), lines.end()};
}

/// Whether a common ancestor may stand where the history was cut off. It may not if all that was cut off is
/// older than the common ancestors that are known.
bool IsDecisionCutOff(const Git& git, const std::vector<std::string>& sides,
                      const std::vector<std::string>& bases) {
    const std::set<std::string> cutOff = CutOffCommits(git);
    if (cutOff.empty()) return false;
    CommandWords command = {"rev-list"};
    command.insert(command.end(), sides.begin(), sides.end());
    for (const std::string& base : bases) command.push_back("^" + base);
    for (const std::string& commit : Lines(git.Output(command)))
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

std::optional<std::string> FindCommit(const Git& git, const std::string& revision) {
    const auto found =
        Ask(git, {"rev-parse", "--verify", "--quiet", "--end-of-options", revision + "^{commit}"});
    return found ? std::optional(FirstLine(*found)) : std::nullopt;
}

NamedCommit CheckedOut(const Git& git) {
    const auto commit = FindCommit(git, "HEAD");
    const auto branch = Ask(git, {"symbolic-ref", "--quiet", "--short", "HEAD"});
    if (!commit) throw Failure("There is no commit here yet" + (branch ? " on " + FirstLine(*branch) : ""));
    constexpr std::size_t kShownDigits = 10;
    return {branch ? FirstLine(*branch) : commit->substr(0, kShownDigits), *commit};
}

std::vector<std::string> RevisionNames(const Git& git) {
    return Lines(git.Output({"for-each-ref", "--format=%(refname:short)"}));
}

std::vector<std::string> MergeBases(const Git& git, const NamedCommit& ours, const NamedCommit& theirs) {
    const auto found = Ask(git, {"merge-base", "--all", ours.id, theirs.id});
    std::vector<std::string> bases = found ? Lines(*found) : std::vector<std::string>();
    if (IsDecisionCutOff(git, {ours.id, theirs.id}, bases))
        throw Failure("This clone is shallow: it lacks the history that tells where " + ours.name + " and " +
                      theirs.name + " parted.\nGet it with \"git fetch --unshallow\"; a CI job that " +
                      "checks out with a depth needs the whole history, such as by \"fetch-depth: 0\"");
    return bases;
}

} // namespace ovrin
