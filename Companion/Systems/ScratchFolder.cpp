#include "Systems/ScratchFolder.h"

#include "Words/Failure.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <sys/stat.h>
#include <system_error>

namespace ovrin {

namespace {

constexpr std::array kSignals = {SIGINT, SIGTERM, SIGHUP};

volatile std::sig_atomic_t g_Signal = 0; // the first that came, to be raised again
std::array<struct sigaction, kSignals.size()> g_Before;

void Remember(int signal) {
    if (!g_Signal) g_Signal = signal;
}

void CatchSignals() {
    for (std::size_t i = 0; i < kSignals.size(); ++i) {
        sigaction(kSignals[i], nullptr, &g_Before[i]);
        struct sigaction caught = {};
        caught.sa_handler = Remember;
        if (g_Before[i].sa_handler != SIG_IGN) sigaction(kSignals[i], &caught, nullptr);
    }
}

void LetSignalsGo() {
    for (std::size_t i = 0; i < kSignals.size(); ++i) sigaction(kSignals[i], &g_Before[i], nullptr);
    if (g_Signal) raise(g_Signal);
}

[[noreturn]] void Fail(const std::string& path) {
    throw Failure("Cannot make a folder in " + path + ": " + std::system_category().message(errno) +
                  ".\nTMPDIR may name another place");
}

} // namespace

ScratchFolder::ScratchFolder() {
    const char* variable = std::getenv("TMPDIR");
    const std::string place = variable && *variable ? variable : "/tmp";
    m_Path = place + "/ovrin-XXXXXX";
    CatchSignals();
    if (!mkdtemp(m_Path.data())) {
        LetSignalsGo();
        Fail(place);
    }
}

ScratchFolder::~ScratchFolder() {
    std::error_code ignored;
    std::filesystem::remove_all(m_Path, ignored);
    LetSignalsGo();
}

std::string ScratchFolder::NewFolder(const std::string& name) const {
    std::string path = File(name);
    if (mkdir(path.c_str(), S_IRWXU) != 0) Fail(m_Path);
    return path;
}

} // namespace ovrin
