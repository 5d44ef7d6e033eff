#include "Systems/GitFiles.h"

#include "FileUtils.h"
#include "Systems/Process.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <algorithm>
#include <sstream>
#include <string_view>

namespace ovrin {

namespace {

constexpr std::size_t kCommitDigits = 40; // and more with SHA-256
constexpr std::size_t kShortDigits = 7;

bool IsCommit(std::string_view text) {
    return text.size() >= kCommitDigits &&
           text.find_first_not_of("0123456789abcdef") == std::string_view::npos;
}

/// A file without the ends of its last line; empty if it can't be read.
std::string Read(const std::string& file) {
    std::string text;
    if (ReadWholeFile(file, text) != ReadResult::Complete) return {};
    while (text.ends_with('\n') || text.ends_with('\r')) text.pop_back();
    return text;
}

/// The folder of what all working trees share.
std::string CommonFolder(const std::string& data) {
    const std::string shared = Read(data + "/commondir");
    if (shared.empty()) return data;
    return shared.starts_with('/') ? shared : data + "/" + shared;
}

std::string PackedCommit(const std::string& folder, const std::string& reference) {
    std::istringstream lines(Read(folder + "/packed-refs"));
    for (std::string line; std::getline(lines, line);)
        if (line.ends_with(" " + reference) && line.size() > reference.size())
            return line.substr(0, line.size() - reference.size() - 1);
    return {};
}

std::string AskedCommit(const std::string& data) {
    try {
        const ProcessResult result =
            RunProcess({"git", "--git-dir", data, "rev-parse", "--verify", "--quiet", "HEAD"});
        return result.Succeeded() ? result.output.substr(0, result.output.find('\n')) : "";
    } catch (const Failure&) { // without git nobody knows
        return {};
    }
}

std::string_view LastLine(std::string_view text) {
    return text.substr(text.rfind('\n') + 1);
}

/// Of a line "pick 3f2a1c9... Dim the light", as a sequencer keeps its commits.
std::string CommitOfLine(std::string_view line) {
    std::istringstream stream{std::string(line)};
    std::string command, commit, subject;
    stream >> command >> commit;
    if (commit == "-C" || commit == "-c") stream >> commit;
    std::getline(stream >> std::ws, subject);
    const bool isCommit =
        commit.size() >= kShortDigits && commit.find_first_not_of("0123456789abcdef") == std::string::npos;
    if (!isCommit) return {};
    if (subject.starts_with("# ")) subject.erase(0, 2);
    return commit.substr(0, kShortDigits) + (subject.empty() ? "" : " (" + subject + ")");
}

} // namespace

std::string ShortCommit(const std::string& name) {
    return IsCommit(name) ? name.substr(0, kShortDigits) : name;
}

GitHead ReadGitHead(const Repository& repository) {
    constexpr std::string_view kReference = "ref: ", kBranches = "refs/heads/";
    GitHead head;
    std::string text = Read(repository.data + "/HEAD");
    if (IsCommit(text)) return {text, ""};
    if (text.starts_with(kReference)) text.erase(0, kReference.size());
    if (text.starts_with(kBranches)) head.branch = text.substr(kBranches.size());
    const std::string folder = CommonFolder(repository.data);
    head.commit = Read(folder + "/" + text);
    if (!IsCommit(head.commit)) head.commit = PackedCommit(folder, text);
    if (!IsCommit(head.commit)) head.commit = AskedCommit(repository.data);
    return head;
}

std::string RebaseTarget(const Repository& repository) {
    constexpr std::string_view kStart = " (start): checkout ";
    const std::string log = Read(repository.data + "/logs/HEAD");
    const std::size_t start = log.rfind(kStart);
    if (start != std::string::npos) {
        const std::size_t name = start + kStart.size();
        return ShortCommit(log.substr(name, log.find('\n', name) - name));
    }
    for (const char* folder : {"/rebase-merge", "/rebase-apply"})
        if (const std::string onto = Read(repository.data + folder + "/onto"); !onto.empty())
            return ShortCommit(onto);
    return {};
}

std::string CommitAtHand(const Repository& repository) {
    const std::string done = Read(repository.data + "/rebase-merge/done");
    if (!done.empty()) return CommitOfLine(LastLine(done));
    const std::string todo = Read(repository.data + "/sequencer/todo");
    if (!todo.empty()) return CommitOfLine(todo.substr(0, todo.find('\n')));
    return ShortCommit(Read(repository.data + "/REBASE_HEAD"));
}

} // namespace ovrin
