#include "Systems/WorkerProcesses.h"

#include "Descriptor.h"
#include "Words/Failure.h"

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstring>
#include <numeric>
#include <poll.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <system_error>
#include <unistd.h>
#include <utility>
#include <vector>

namespace ovrin {

namespace {

using Work = std::function<std::string(std::size_t)>;
using Take = std::function<void(std::size_t, WorkerAnswer)>;

int g_ClosedInCopies = -1;

bool SendAll(int socket, const void* bytes, std::size_t count) {
    const auto* from = static_cast<const char*>(bytes);
    while (count > 0) {
        const ssize_t sent = Uninterrupted([&] { return send(socket, from, count, MSG_NOSIGNAL); });
        if (sent <= 0) return false;
        from += sent;
        count -= static_cast<std::size_t>(sent);
    }
    return true;
}

/// What a process does: takes the number of a piece, and answers with the length of a text and the text.
[[noreturn]] void Serve(int socket, const Work& work) {
    try {
        for (std::uint64_t index = 0; Uninterrupted([&] {
                                          return recv(socket, &index, sizeof(index), MSG_WAITALL);
                                      }) == sizeof(index);) {
            const std::string text = work(static_cast<std::size_t>(index));
            const std::uint64_t length = text.size();
            if (!SendAll(socket, &length, sizeof(length)) || !SendAll(socket, text.data(), text.size()))
                break;
        }
    } catch (const std::exception&) {
        _exit(1); // the piece is told as one that ended its process
    }
    _exit(0);
}

/// A process, as this one sees it.
class Worker {
public:
    Worker(pid_t process, Descriptor socket) : m_Process(process), m_Socket(std::move(socket)) {}
    Worker(Worker&& other) noexcept
        : m_Process(std::exchange(other.m_Process, 0)), m_Socket(std::move(other.m_Socket)),
          m_Piece(other.m_Piece), m_Done(other.m_Done), m_Received(std::move(other.m_Received)) {}
    Worker& operator=(Worker&& other) noexcept {
        std::swap(m_Process, other.m_Process);
        std::swap(m_Socket, other.m_Socket);
        std::swap(m_Piece, other.m_Piece);
        std::swap(m_Done, other.m_Done);
        std::swap(m_Received, other.m_Received);
        return *this;
    }
    ~Worker() {
        if (!m_Process) return;
        if (m_Piece) kill(m_Process, SIGKILL);
        m_Socket.Close();
        Wait();
    }

    bool IsIdle() const { return !m_Piece; }
    std::uint64_t Done() const { return m_Done; }
    int Socket() const { return m_Socket.Get(); }
    std::size_t Piece() const { return *m_Piece; }

    /// False if the process came to an end before.
    bool Begin(std::size_t piece, std::uint64_t size) {
        const std::uint64_t index = piece;
        if (!SendAll(m_Socket.Get(), &index, sizeof(index))) return false;
        m_Piece = piece;
        m_Done += size;
        return true;
    }

    /// Reads what has come. Returns the answer once it is whole; the process is over if it has no text.
    std::optional<WorkerAnswer> Receive() {
        char buffer[std::size_t{64} * 1024];
        const ssize_t count = Uninterrupted([&] { return recv(m_Socket.Get(), buffer, sizeof(buffer), 0); });
        if (count <= 0) return WorkerAnswer{{}, Wait()};
        m_Received.append(buffer, static_cast<std::size_t>(count));
        std::uint64_t length = 0;
        if (m_Received.size() < sizeof(length)) return {};
        std::memcpy(&length, m_Received.data(), sizeof(length));
        if (m_Received.size() < sizeof(length) + length) return {};
        m_Piece.reset();
        return WorkerAnswer{std::exchange(m_Received, {}).substr(sizeof(length)), {}};
    }

private:
    std::string Wait() {
        int status = 0;
        Uninterrupted([&] { return waitpid(m_Process, &status, 0); });
        m_Process = 0;
        return WIFSIGNALED(status) ? "killed by signal " + std::to_string(WTERMSIG(status))
                                   : "ended with status " + std::to_string(WEXITSTATUS(status));
    }

    pid_t m_Process;
    Descriptor m_Socket;
    std::optional<std::size_t> m_Piece;
    std::uint64_t m_Done = 0;
    std::string m_Received;
};

class Pool {
public:
    Pool(std::span<const std::uint64_t> sizes, const WorkLimits& limits, const Work& work)
        : m_Sizes(sizes), m_Limits(limits), m_Work(work), m_Largest(sizes.size()) {
        std::iota(m_Largest.begin(), m_Largest.end(), std::size_t{0});
        std::ranges::stable_sort(m_Largest, std::ranges::greater(),
                                 [&](std::size_t i) { return m_Sizes[i]; });
    }

    void Run(const Take& take) {
        while (m_Next < m_Largest.size() || !std::ranges::all_of(m_Workers, &Worker::IsIdle)) {
            while (m_Next < m_Largest.size() && BeginNext()) {
            }
            TakeAnswers(take);
        }
    }

private:
    /// False if all that may live are at work.
    bool BeginNext() {
        const std::size_t piece = m_Largest[m_Next];
        const std::uint64_t size = m_Sizes[piece];
        auto idle = std::ranges::find_if(m_Workers, &Worker::IsIdle);
        if (idle != m_Workers.end() && !(Fits(*idle, size) && FitsTogether(size))) {
            m_Workers.erase(idle); // its memory comes back
            return true;
        }
        if (idle == m_Workers.end()) {
            if (m_Workers.size() >= m_Limits.processes || !FitsTogether(size)) return false;
            Start();
            idle = std::prev(m_Workers.end());
        }
        if (idle->Begin(piece, size)) {
            ++m_Next;
            return true;
        }
        // One that has worked may have come to its end; where a new one does, so would the next.
        if (idle->Done() == 0) throw Failure("Cannot start a process: it ends before it has begun");
        m_Workers.erase(idle);
        return true;
    }

    bool Fits(const Worker& worker, std::uint64_t size) const {
        return worker.Done() + size <= m_Limits.perProcess;
    }

    bool FitsTogether(std::uint64_t size) const {
        std::uint64_t together = size;
        for (const Worker& worker : m_Workers) together += worker.Done();
        return m_Workers.empty() || together <= m_Limits.together;
    }

    void Start() {
        int ends[2];
        if (socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends) != 0) Fail();
        Descriptor here(ends[0]), there(ends[1]);
        const pid_t process = fork();
        if (process < 0) Fail();
        if (process == 0) {
            here.Close();
            CloseInCopy();
            for (const Worker& other : m_Workers) close(other.Socket()); // theirs end when this process does
            Serve(there.Get(), m_Work);
        }
        m_Workers.emplace_back(process, std::move(here));
    }

    [[noreturn]] static void Fail() {
        throw Failure("Cannot start a process: " + std::system_category().message(errno));
    }

    void TakeAnswers(const Take& take) {
        std::vector<pollfd> ends;
        for (const Worker& worker : m_Workers)
            ends.push_back({worker.IsIdle() ? -1 : worker.Socket(), POLLIN, 0});
        if (poll(ends.data(), ends.size(), -1) < 0) return; // a signal
        for (std::size_t i = ends.size(); i-- > 0;) {
            if (!ends[i].revents) continue;
            const std::size_t piece = m_Workers[i].Piece();
            std::optional<WorkerAnswer> answer = m_Workers[i].Receive();
            if (!answer) continue;
            if (!answer->text) m_Workers.erase(m_Workers.begin() + static_cast<std::ptrdiff_t>(i));
            take(piece, std::move(*answer));
        }
    }

    const std::span<const std::uint64_t> m_Sizes;
    const WorkLimits m_Limits;
    const Work& m_Work;
    std::vector<std::size_t> m_Largest; // the pieces
    std::size_t m_Next = 0;             // of them
    std::vector<Worker> m_Workers;
};

} // namespace

void WorkInProcesses(std::span<const std::uint64_t> sizes, const WorkLimits& limits, const Work& work,
                     const Take& take) {
    Pool(sizes, limits, work).Run(take);
}

ClosedInCopies::ClosedInCopies(int descriptor) {
    g_ClosedInCopies = descriptor;
}

ClosedInCopies::~ClosedInCopies() {
    g_ClosedInCopies = -1;
}

void CloseInCopy() {
    Descriptor(std::exchange(g_ClosedInCopies, -1)).Close();
}

} // namespace ovrin
