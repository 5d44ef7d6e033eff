#include "Systems/ChildProcess.h"

#include "Words/Failure.h"

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <fcntl.h>
#include <spawn.h>
#include <string_view>
#include <sys/wait.h>
#include <system_error>
#include <unistd.h>

namespace ovrin {

namespace {

/// A list of texts as the system wants it.
std::vector<char*> Pointers(const std::vector<std::string>& texts) {
    std::vector<char*> pointers;
    pointers.reserve(texts.size() + 1);
    for (const std::string& text : texts) pointers.push_back(const_cast<char*>(text.c_str()));
    pointers.push_back(nullptr);
    return pointers;
}

std::vector<std::string> Environment(const ProcessSetting& setting) {
    std::vector<std::string> variables;
    for (const auto& [name, value] : setting.environment)
        variables.emplace_back(name).append("=").append(value);
    for (char** variable = environ; *variable; ++variable) {
        const std::string_view text = *variable;
        const bool isReplaced = std::ranges::any_of(
            setting.environment, [&](const auto& added) { return text.starts_with(added.first + "="); });
        if (!isReplaced) variables.emplace_back(text);
    }
    return variables;
}

/// What a new process is to be: its folder, its session, its standard streams, and signals as programs expect
/// them.
class Start {
public:
    Start(const ProcessSetting& setting, const std::array<int, 3>& streams) {
        posix_spawn_file_actions_init(&m_Actions);
        posix_spawnattr_init(&m_Attributes);
        for (int number = 0; number < 3; ++number)
            posix_spawn_file_actions_adddup2(&m_Actions, streams[static_cast<std::size_t>(number)], number);
        if (!setting.folder.empty()) posix_spawn_file_actions_addchdir_np(&m_Actions, setting.folder.c_str());
        sigset_t signals;
        sigemptyset(&signals);
        for (const int signal : {SIGPIPE, SIGXFSZ}) sigaddset(&signals, signal);
        posix_spawnattr_setsigdefault(&m_Attributes, &signals);
        const int apart = setting.isApart ? POSIX_SPAWN_SETSID : 0;
        posix_spawnattr_setflags(&m_Attributes, static_cast<short>(POSIX_SPAWN_SETSIGDEF | apart));
    }
    Start(const Start&) = delete;
    Start& operator=(const Start&) = delete;
    ~Start() {
        posix_spawn_file_actions_destroy(&m_Actions);
        posix_spawnattr_destroy(&m_Attributes);
    }

    pid_t Run(const CommandWords& command, const ProcessSetting& setting) const {
        const std::vector<std::string> variables = Environment(setting);
        pid_t child = 0;
        const int error = posix_spawnp(&child, command[0].c_str(), &m_Actions, &m_Attributes,
                                       Pointers(command).data(), Pointers(variables).data());
        if (error) throw Failure("Cannot start " + command[0] + ": " + std::system_category().message(error));
        return child;
    }

private:
    posix_spawn_file_actions_t m_Actions;
    posix_spawnattr_t m_Attributes;
};

} // namespace

Pipe::Pipe() {
    int ends[2];
    if (pipe2(ends, O_CLOEXEC) != 0)
        throw Failure("Cannot make a pipe: " + std::system_category().message(errno));
    read = Descriptor(ends[0]);
    write = Descriptor(ends[1]);
}

pid_t StartProcess(const CommandWords& command, const ProcessSetting& setting,
                   const std::array<int, 3>& streams) {
    return Start(setting, streams).Run(command, setting);
}

int WaitForProcess(pid_t child) {
    int status = 0;
    Uninterrupted([&] { return waitpid(child, &status, 0); });
    return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

} // namespace ovrin
