#pragma once

#include <exception>
#include <functional>
#include <memory>
#include <thread>

namespace ovrin_yaml {

/// Where a stage may start threads.
enum class Threads {
    None,
    WhereWorthwhile, ///< not for so little work that starting one would take longer
    Everywhere       ///< for tests
};

/// A thread that carries an exception to the one who waits for it. Join every thread of a stage before asking
/// any for its exception: then no failure leaves another thread running.
class Thread {
public:
    /// Starts `body`, or runs it here and now if no thread is to be had, or if it is so little work that
    /// starting a thread would take longer.
    explicit Thread(std::function<void()> body, bool isLittle = false);
    Thread(Thread&&) = default;
    Thread& operator=(Thread&&) = delete;

    /// Waits for the end of the body. So does the destructor.
    void Join();
    /// Throws what left the body, of whatever type. Only after Join.
    void CheckForExceptions() const;

private:
    struct Work {
        std::function<void()> body;
        std::exception_ptr exception;
        void Run() noexcept;
    };

    std::unique_ptr<Work> m_Work; // the started thread holds its address
    std::jthread m_Thread;        // none once joined, or when the body ran on the spawning thread
};

} // namespace ovrin_yaml
