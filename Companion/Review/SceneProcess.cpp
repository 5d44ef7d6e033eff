#include "Review/SceneProcess.h"

#include "Systems/WorkerProcesses.h"
#include "WebGate/WebFrame.h"
#include "Words/Failure.h"

#include <cerrno>
#include <csignal>
#include <exception>
#include <sys/socket.h>
#include <sys/wait.h>
#include <system_error>
#include <unistd.h>

namespace ovrin {

namespace {

[[noreturn]] void Serve(int socket, const std::function<SceneProcess::Answer()>& open) {
    try {
        const SceneProcess::Answer answer = open();
        while (const auto question = ReceiveFrame(socket, kMostRequestFrame))
            if (!SendFrame(socket, answer(*question))) break;
    } catch (const std::exception&) {
        _exit(1); // told as the end of the process
    }
    _exit(0);
}

[[noreturn]] void Fail() {
    throw Failure("Cannot start a process: " + std::system_category().message(errno));
}

} // namespace

SceneProcess::SceneProcess(const std::function<Answer()>& open) {
    int ends[2];
    if (socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends) != 0) Fail();
    Descriptor here(ends[0]), there(ends[1]);
    m_Process = fork();
    if (m_Process < 0) Fail();
    if (m_Process == 0) {
        CloseInCopy();
        here.Close();
        Serve(there.Get(), open);
    }
    m_Socket = std::move(here);
}

SceneProcess::~SceneProcess() {
    // It holds nothing that could be lost.
    kill(m_Process, SIGKILL);
    Uninterrupted([&] { return waitpid(m_Process, nullptr, 0); });
}

SceneProcess::Texts SceneProcess::Ask(const Texts& question) {
    const bool isSent = SendFrame(m_Socket.Get(), question);
    std::optional<Texts> answer = isSent ? ReceiveFrame(m_Socket.Get(), kMostAnswerFrame) : std::nullopt;
    if (!answer) throw Failure("The process for this scene came to its end: ask again");
    return std::move(*answer);
}

} // namespace ovrin
