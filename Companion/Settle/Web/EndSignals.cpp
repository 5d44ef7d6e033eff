#include "Settle/Web/EndSignals.h"

#include <cerrno>
#include <unistd.h>

namespace ovrin {

namespace {

volatile std::sig_atomic_t g_Pipe = -1;

void TellPipe(int) {
    const int error = errno;
    const char byte = 0;
    [[maybe_unused]] const ssize_t written = write(g_Pipe, &byte, 1);
    errno = error;
}

} // namespace

EndSignals::EndSignals() {
    g_Pipe = m_Pipe.write.Get();
    struct sigaction action {};
    action.sa_handler = TellPipe;
    action.sa_flags = SA_RESTART | static_cast<int>(SA_RESETHAND);
    for (std::size_t i = 0; i < kSignals.size(); ++i) {
        sigaction(kSignals[i], nullptr, &m_Before[i]);
        // What is ignored, such as hanging up under nohup, stays so.
        if (m_Before[i].sa_handler != SIG_IGN) sigaction(kSignals[i], &action, nullptr);
    }
}

EndSignals::~EndSignals() {
    for (std::size_t i = 0; i < kSignals.size(); ++i) sigaction(kSignals[i], &m_Before[i], nullptr);
}

} // namespace ovrin
