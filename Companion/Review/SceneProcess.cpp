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

SceneProcess::Answer OpenOrFail(const std::function<SceneProcess::Answer()>& open) {
    try {
        return open();
    } catch (const Failure& failure) {
        return [answer = PageError(409, failure.what())](const PageRequest&) { return answer; };
    }
}

/// A request is {method, path, body, key, value...}, its answer {status, type, body}.
[[noreturn]] void Serve(int socket, const std::function<SceneProcess::Answer()>& open) {
    try {
        const SceneProcess::Answer answerTo = OpenOrFail(open);
        while (const auto frame = ReceiveFrame(socket, kMostRequestFrame)) {
            PageRequest request{frame->at(0), frame->at(1), {}, frame->at(2)};
            for (std::size_t i = 3; i + 1 < frame->size(); i += 2)
                request.query.emplace((*frame)[i], (*frame)[i + 1]);
            const PageAnswer answer = answerTo(request);
            if (!SendFrame(socket, {std::to_string(answer.status), answer.type, answer.body})) break;
        }
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

PageAnswer SceneProcess::Ask(const PageRequest& request) {
    WebFrame frame = {request.method, request.path, request.body};
    for (const auto& [key, value] : request.query) {
        frame.push_back(key);
        frame.push_back(value);
    }
    const auto answer =
        SendFrame(m_Socket.Get(), frame) ? ReceiveFrame(m_Socket.Get(), kMostAnswerFrame) : std::nullopt;
    if (!answer) throw Failure("The process for this scene came to its end: ask again");
    return {std::stoi(answer->at(0)), answer->at(1), answer->at(2)};
}

} // namespace ovrin
