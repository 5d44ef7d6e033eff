#include "Systems/Caller.h"

#include "FileUtils.h"

#include <algorithm>
#include <cstdlib>
#include <iterator>
#include <sstream>
#include <unistd.h>

namespace ovrin {

namespace {

/// Options ahead of the command that have a value behind them.
constexpr const char* kOptionsWithValue[] = {"-C",           "-c",           "--git-dir",    "--work-tree",
                                             "--namespace",  "--config-env", "--exec-path",  "--super-prefix",
                                             "--repository", "-R",           "--cwd",        "--config",
                                             "--color",      "--encoding",   "--config-dir", "--username"};

std::string LastPart(const std::string& path) {
    return path.substr(path.rfind('/') + 1);
}

/// "git" and the like; empty for any other program.
std::string SystemOf(const std::string& program) {
    for (const char* system : {"git", "hg", "svn"})
        if (program == system) return system;
    return {};
}

std::vector<std::string> WordsOf(pid_t process) {
    std::vector<std::string> words;
    std::string bytes;
    if (ReadWholeFile("/proc/" + std::to_string(process) + "/cmdline", bytes) != ReadResult::Complete)
        return words;
    std::istringstream stream(std::move(bytes));
    for (std::string word; std::getline(stream, word, '\0');) words.push_back(word);
    return words;
}

/// What the machine tells of a process, from its state on; nothing where there is none.
std::vector<std::string> FieldsOf(pid_t process) {
    std::string bytes;
    if (ReadWholeFile("/proc/" + std::to_string(process) + "/stat", bytes) != ReadResult::Complete) return {};
    // "12 (a name) S 11 ...", where the name may hold anything.
    const std::size_t name = bytes.rfind(')');
    if (name == std::string::npos) return {};
    std::istringstream stream(bytes.substr(name + 1));
    return {std::istream_iterator<std::string>(stream), {}};
}

/// 0 where there is none.
pid_t ParentOf(pid_t process) {
    const std::vector<std::string> fields = FieldsOf(process);
    return fields.size() > 1 ? std::atoi(fields[1].c_str()) : 0;
}

/// Numbers of processes come again, but not with the same beginning.
std::string IdentityOf(pid_t process) {
    constexpr std::size_t kBegin = 19;
    const std::vector<std::string> fields = FieldsOf(process);
    return fields.size() > kBegin ? std::to_string(process) + " since " + fields[kBegin] : "";
}

} // namespace

std::vector<std::string> Caller::Operands() const {
    std::vector<std::string> operands;
    std::ranges::copy_if(words, std::back_inserter(operands),
                         [](const std::string& word) { return !word.starts_with('-'); });
    return operands;
}

std::optional<Caller> CallerOf(const std::vector<std::string>& words) {
    std::size_t at = 0;
    // Mercurial is a script, so that its interpreter stands in front.
    if (words.size() > 1 && LastPart(words[0]).starts_with("python")) ++at;
    if (at >= words.size()) return {};
    Caller caller;
    const std::string program = LastPart(words[at++]);
    caller.program = SystemOf(program.substr(0, program.find('-')));
    if (caller.program.empty()) return {};
    if (program != caller.program) {
        caller.command = program.substr(caller.program.size() + 1);
    } else {
        while (at < words.size() && words[at].starts_with('-')) {
            const bool hasValue =
                std::ranges::find(kOptionsWithValue, words[at]) != std::end(kOptionsWithValue);
            at += hasValue ? 2 : 1;
        }
        if (at < words.size()) caller.command = words[at++];
    }
    if (at < words.size()) caller.words.assign(words.begin() + static_cast<std::ptrdiff_t>(at), words.end());
    return caller;
}

std::optional<Caller> FindCaller() {
    constexpr int kMostLevels = 16;
    pid_t process = getppid();
    for (int level = 0; level < kMostLevels && process > 1; ++level) {
        if (auto caller = CallerOf(WordsOf(process))) {
            caller->process = IdentityOf(process);
            return caller;
        }
        process = ParentOf(process);
    }
    return {};
}

} // namespace ovrin
