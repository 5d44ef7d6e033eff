#include "Conflicts/FindOccasion.h"

#include "Systems/Caller.h"
#include "Systems/GitFiles.h"
#include "Systems/Operation.h"
#include "Systems/Repository.h"

#include <algorithm>
#include <cstdlib>
#include <string_view>
#include <unistd.h>

namespace ovrin {

namespace {

std::string Variable(const char* name) {
    const char* text = std::getenv(name);
    return text ? text : "";
}

/// What "git merge" says of the commits that it was given: GITHEAD_3f2a1c9...=topic.
std::string MergedHead() {
    constexpr std::string_view kBeginning = "GITHEAD_";
    for (char** variable = environ; *variable; ++variable) {
        const std::string_view text = *variable;
        if (!text.starts_with(kBeginning)) continue;
        return ShortCommit(std::string(text.substr(text.find('=') + 1)));
    }
    return {};
}

/// The name that was typed, unless several were or none.
std::string OnlyOperand(const Caller& caller) {
    const std::vector<std::string> operands = caller.Operands();
    return operands.size() == 1 ? ShortCommit(operands[0]) : "";
}

bool IsThere(const Repository& repository, const char* folder) {
    return access((repository.data + folder).c_str(), F_OK) == 0;
}

/// The action by the command; by the repository's files where that is an alias or unknown.
std::string ActionOf(const Repository& repository, const Caller& caller) {
    if (caller.command == "am")
        return std::ranges::find(caller.words, "--rebasing") != caller.words.end() ? "rebase" : "am";
    for (const char* action : {"merge", "rebase", "cherry-pick", "revert", "stash"})
        if (caller.command == action) return action;
    if (IsThere(repository, "/rebase-merge") || IsThere(repository, "/rebase-apply")) return "rebase";
    return MergedHead().empty() ? "" : "merge";
}

/// The commit that comes in with a cherry-pick or revert.
std::string PickedCommit(const Repository& repository, const Caller& caller) {
    const std::string atHand = CommitAtHand(repository);
    return atHand.empty() ? OnlyOperand(caller) : atHand;
}

/// Whether a commit is picked or reverted in the working tree alone.
bool IsWithoutCommit(const Caller& caller) {
    return (caller.command == "cherry-pick" || caller.command == "revert") &&
           std::ranges::any_of(caller.words,
                               [](const std::string& word) { return word == "-n" || word == "--no-commit"; });
}

/// "git checkout --merge FILE" makes a conflict again, of whatever is under way: that is as good as its
/// command, of which the words aren't known. Of branches the same command takes local changes along.
Caller WhoMadeIt(const Repository& repository, const Caller& caller) {
    if (caller.command != "checkout" && caller.command != "restore") return caller;
    const std::string action = OperationIn(repository).action;
    const bool namesFiles = std::ranges::find(caller.words, "--") != caller.words.end();
    return action.empty() && !namesFiles ? caller : Caller{caller.program, action, {}};
}

Occasion OfGit(const Repository& repository, const Caller& caller) {
    const GitHead head = ReadGitHead(repository);
    Occasion occasion;
    occasion.action = ActionOf(repository, caller);
    occasion.head = head.commit;
    occasion.ours = head.branch.empty() ? ShortCommit(head.commit) : head.branch;
    if (occasion.action == "merge") occasion.theirs = MergedHead();
    if (occasion.action == "rebase") {
        const std::string target = RebaseTarget(repository);
        if (!target.empty()) occasion.ours = target;
        occasion.theirs = CommitAtHand(repository);
    }
    if (occasion.action == "cherry-pick") occasion.theirs = PickedCommit(repository, caller);
    if (occasion.action == "revert") {
        const std::string reverted = PickedCommit(repository, caller);
        occasion.base = reverted;
        if (!reverted.empty()) occasion.theirs = "parent of " + reverted;
    }
    if (occasion.action == "stash") occasion.theirs = "the stash";
    if (occasion.action == "am") occasion.theirs = "the patch";
    if (IsWithoutTree(caller)) {
        const std::vector<std::string> operands = caller.Operands();
        occasion.ours = operands.size() == 2 ? ShortCommit(operands[0]) : "";
        occasion.theirs = operands.size() == 2 ? ShortCommit(operands[1]) : "";
    }
    // Nothing is left that would tell later that it is under way.
    if (IsWithoutCommit(caller)) occasion.action.clear();
    // Local changes are taken along to another branch, which becomes the head afterwards.
    if (caller.command == "checkout" || caller.command == "switch")
        occasion = {"", "", OnlyOperand(caller), "your changes", ""};
    return occasion;
}

Occasion OfMercurial(const Caller& caller) {
    constexpr std::size_t kShortNode = 12;
    const auto node = [](const char* name) { return Variable(name).substr(0, kShortNode); };
    Occasion occasion = {caller.command, node("HG_BASE_NODE"), node("HG_MY_NODE"), node("HG_OTHER_NODE"), ""};
    if (caller.command == "resolve" || caller.program != "hg") occasion.action.clear();
    return occasion;
}

/// What git and Mercurial write for whatever is checked out, and for a side that they have no name for.
bool SaysNothing(const std::string& label) {
    constexpr const char* kWords[] = {"",         "%S",     "%X",    "%Y",    "HEAD", "Updated upstream",
                                      "ours",     "theirs", "local", "other", "base", "working copy",
                                      "merge rev"};
    return std::ranges::find(kWords, label) != std::end(kWords);
}

void Prefer(const std::string& given, std::string& label) {
    if (!SaysNothing(given)) label = given;
}

} // namespace

Occasion FindOccasion(const std::optional<Repository>& repository, const std::optional<Caller>& caller,
                      const GivenLabels& given) {
    Occasion occasion;
    const Caller known = caller.value_or(Caller());
    if (repository && repository->kind == SystemKind::Git)
        occasion = OfGit(*repository, WhoMadeIt(*repository, known));
    if (repository && repository->kind == SystemKind::Mercurial) occasion = OfMercurial(known);
    if (repository && repository->kind == SystemKind::Subversion)
        occasion = {known.command, "", "the working copy", "the repository", ""};
    Prefer(given.base, occasion.base);
    Prefer(given.ours, occasion.ours);
    Prefer(given.theirs, occasion.theirs);
    return occasion;
}

bool IsWithoutTree(const std::optional<Caller>& caller) {
    return caller && caller->program == "git" &&
           (caller->command == "merge-tree" || caller->command == "replay");
}

} // namespace ovrin
