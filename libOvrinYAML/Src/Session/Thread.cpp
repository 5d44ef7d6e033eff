#include "Session/Thread.h"

#include <system_error>

namespace ovrin_yaml {

Thread::Thread(std::function<void()> body, bool isLittle) : m_Work(new Work{std::move(body), nullptr}) {
    if (isLittle) {
        m_Work->Run();
        return;
    }
    try {
        m_Thread = std::jthread([work = m_Work.get()] { work->Run(); });
    } catch (const std::system_error&) {
        m_Work->Run();
    }
}

void Thread::Work::Run() noexcept {
    try {
        body();
    } catch (...) {
        exception = std::current_exception();
    }
}

void Thread::Join() {
    if (m_Thread.joinable()) m_Thread.join();
}

void Thread::CheckForExceptions() const {
    if (m_Work->exception) std::rethrow_exception(m_Work->exception);
}

} // namespace ovrin_yaml
