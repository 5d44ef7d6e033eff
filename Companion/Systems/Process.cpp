#include "Systems/Process.h"

#include "Descriptor.h"
#include "Words/Failure.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <poll.h>
#include <spawn.h>
#include <sstream>
#include <sys/wait.h>
#include <system_error>
#include <unistd.h>

namespace ovrin {

namespace {

struct Pipe {
    Descriptor read, write;

    Pipe() {
        int ends[2];
        if (pipe2(ends, O_CLOEXEC) != 0)
            throw Failure("Cannot make a pipe: " + std::system_category().message(errno));
        read = Descriptor(ends[0]);
        write = Descriptor(ends[1]);
    }
};

/// A list of texts as the system wants it.
std::vector<char*> Pointers(const std::vector<std::string>& texts) {
    std::vector<char*> pointers;
    for (const std::string& text : texts) pointers.push_back(const_cast<char*>(text.c_str()));
    pointers.push_back(nullptr);
    return pointers;
}

std::vector<std::string> Environment(const ProcessSetting& setting) {
    std::vector<std::string> variables;
    for (const auto& [name, value] : setting.environment) variables.push_back(name + "=" + value);
    for (char** variable = environ; *variable; ++variable) {
        const std::string_view text = *variable;
        const bool isReplaced = std::ranges::any_of(
            setting.environment, [&](const auto& added) { return text.starts_with(added.first + "="); });
        if (!isReplaced) variables.emplace_back(text);
    }
    return variables;
}

/// What a new process is to be: its folder, its standard streams, and signals as programs expect them.
class Start {
public:
    Start(const std::string& folder, const std::array<int, 3>& streams) {
        posix_spawn_file_actions_init(&m_Actions);
        posix_spawnattr_init(&m_Attributes);
        for (int number = 0; number < 3; ++number)
            posix_spawn_file_actions_adddup2(&m_Actions, streams[static_cast<std::size_t>(number)], number);
        if (!folder.empty()) posix_spawn_file_actions_addchdir_np(&m_Actions, folder.c_str());
        sigset_t signals;
        sigemptyset(&signals);
        for (const int signal : {SIGPIPE, SIGXFSZ}) sigaddset(&signals, signal);
        posix_spawnattr_setsigdefault(&m_Attributes, &signals);
        posix_spawnattr_setflags(&m_Attributes, POSIX_SPAWN_SETSIGDEF);
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

/// Writes `input` and reads both outputs, as they come, until all are closed.
void Talk(Descriptor& toChild, std::string_view input, Descriptor& output, ProcessResult& result,
          Descriptor& errors) {
    if (input.empty()) toChild.Close();
    if (toChild.IsOpen()) fcntl(toChild.Get(), F_SETFL, O_NONBLOCK);
    char buffer[std::size_t{64} * 1024];
    const auto take = [&](Descriptor& from, std::string& into) {
        const ssize_t count = Uninterrupted([&] { return read(from.Get(), buffer, sizeof(buffer)); });
        if (count > 0)
            into.append(buffer, static_cast<std::size_t>(count));
        else
            from.Close();
    };
    while (toChild.IsOpen() || output.IsOpen() || errors.IsOpen()) {
        std::array<pollfd, 3> ends = {{{toChild.IsOpen() ? toChild.Get() : -1, POLLOUT, 0},
                                       {output.IsOpen() ? output.Get() : -1, POLLIN, 0},
                                       {errors.IsOpen() ? errors.Get() : -1, POLLIN, 0}}};
        if (poll(ends.data(), ends.size(), -1) < 0) continue; // a signal
        if (ends[0].revents) {
            const ssize_t count = write(toChild.Get(), input.data(), input.size());
            if (count > 0) input.remove_prefix(static_cast<std::size_t>(count));
            if (input.empty() || (count < 0 && errno != EAGAIN && errno != EINTR)) toChild.Close();
        }
        if (ends[1].revents) take(output, result.output);
        if (ends[2].revents) take(errors, result.errors);
    }
}

int WaitFor(pid_t child) {
    int status = 0;
    Uninterrupted([&] { return waitpid(child, &status, 0); });
    return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

} // namespace

ProcessResult RunProcess(const CommandWords& command, const ProcessSetting& setting) {
    Pipe input, output, errors;
    const Start start(setting.folder, {input.read.Get(), output.write.Get(),
                                       setting.showErrors ? STDERR_FILENO : errors.write.Get()});
    const pid_t child = start.Run(command, setting);
    for (Descriptor* end : {&input.read, &output.write, &errors.write}) end->Close();
    ProcessResult result{};
    Talk(input.write, setting.input, output.read, result, errors.read);
    result.status = WaitFor(child);
    return result;
}

std::string OutputOf(const CommandWords& command, const ProcessSetting& setting) {
    ProcessResult result = RunProcess(command, setting);
    if (result.Succeeded()) return std::move(result.output);
    std::string words;
    for (const std::string& word : command) words += (words.empty() ? "" : " ") + word;
    throw Failure("\"" + words + "\" failed with status " + std::to_string(result.status) +
                  (result.errors.empty() ? "" : ":\n" + result.errors));
}

std::vector<std::string> ZeroEndedTexts(std::string_view listed) {
    std::vector<std::string> texts;
    for (std::size_t end; (end = listed.find('\0')) != std::string_view::npos; listed.remove_prefix(end + 1))
        texts.emplace_back(listed.substr(0, end));
    return texts;
}

std::string FindProgram(const std::string& name) {
    const char* path = std::getenv("PATH");
    std::istringstream folders(path ? path : "/usr/bin:/bin");
    for (std::string folder; std::getline(folders, folder, ':');) {
        const std::string place = (folder.empty() ? "." : folder) + "/" + name;
        if (access(place.c_str(), X_OK) == 0) return place;
    }
    return {};
}

} // namespace ovrin
