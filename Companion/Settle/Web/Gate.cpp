#include "Settle/Web/Gate.h"

#include "FileUtils.h"
#include "Systems/ChildProcess.h"
#include "Words/Failure.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <poll.h>
#include <sys/random.h>
#include <sys/socket.h>
#include <system_error>
#include <unistd.h>
#include <utility>

namespace ovrin {

namespace {

constexpr const char* kProgram = "ovrin-web";
constexpr int kMillisecondsToEnd = 5000;

std::string ProgramFile() {
    std::string file = GetDataFilesDir() + kProgram;
    if (access(file.c_str(), X_OK) == 0) return file;
    throw Failure(
        "The browser needs the program ovrin-web, which isn't installed beside ovrin: it comes with the "
        "Debian package, and from source where cpp-httplib is installed. Without it, \"ovrin settle\" works "
        "in the terminal, and \"ovrin review --html FILE\" writes a page");
}

/// 128 bits that nobody can guess, as hexadecimal digits.
std::string NewToken() {
    std::array<unsigned char, 16> bytes{};
    if (Uninterrupted([&] { return getrandom(bytes.data(), bytes.size(), 0); }) != ssize_t{bytes.size()})
        throw Failure("The system has no random numbers for the address of the page: " +
                      std::system_category().message(errno));
    std::string token;
    for (const unsigned char byte : bytes) {
        token += "0123456789abcdef"[byte >> 4];
        token += "0123456789abcdef"[byte & 15];
    }
    return token;
}

} // namespace

Gate::Child::~Child() {
    if (process <= 0) return;
    kill(process, SIGKILL);
    WaitForProcess(process);
}

Gate::Gate(int port) {
    const std::string file = ProgramFile();
    int ends[2];
    if (socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends) != 0)
        throw Failure("Cannot start ovrin-web: " + std::system_category().message(errno));
    m_Socket = Descriptor(ends[0]);
    m_ClosedInCopies.emplace(ends[0]);
    const Descriptor there(ends[1]);
    m_Child.process = StartProcess({file}, {.isApart = true}, {there.Get(), STDERR_FILENO, STDERR_FILENO});
    Begin(port, NewToken());
}

void Gate::Begin(int port, const std::string& token) {
    Send({"serve", token, std::to_string(port)});
    const WebFrame begun = Receive();
    if (begun.size() != 2 || begun[0] != "serving")
        throw Failure("The page can't be served: " + begun.back() + "; name another port with --port");
    m_Address = "http://127.0.0.1:" + begun[1] + "/" + token + "/";
}

WebFrame Gate::Receive() {
    std::optional<WebFrame> frame = ReceiveFrame(m_Socket.Get(), kMostRequestFrame);
    if (!frame || frame->empty()) TellEnd();
    return *std::move(frame);
}

void Gate::Send(const WebFrame& frame) {
    if (!SendFrame(m_Socket.Get(), frame)) TellEnd();
}

void Gate::TellEnd() {
    m_Socket.Close();
    const int status = WaitForProcess(std::exchange(m_Child.process, 0));
    throw Failure("ovrin-web, which serves the page, came to its end with status " + std::to_string(status) +
                  ". Nothing is lost: run the same command again");
}

void Gate::AwaitEnd() const {
    pollfd end{m_Socket.Get(), POLLRDHUP, 0};
    Uninterrupted([&] { return poll(&end, 1, kMillisecondsToEnd); });
}

} // namespace ovrin
