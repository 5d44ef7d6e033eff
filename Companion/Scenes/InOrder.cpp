#include "Scenes/InOrder.h"

#include <algorithm>
#include <condition_variable>
#include <exception>
#include <mutex>
#include <system_error>
#include <thread>

namespace ovrin {

namespace {

std::size_t Processors() {
    return std::max(1u, std::thread::hardware_concurrency());
}

/// Hands out work, and keeps what is done until it is taken.
class Row {
public:
    Row(std::size_t count, const std::function<void(std::size_t)>& work)
        : m_Count(count), m_Work(work), m_States(WaitingResults()) {}

    /// Works until nothing is left to begin: what a helper does.
    void Help() {
        std::unique_lock lock(m_Lock);
        while (m_Next < m_Count) {
            if (HasRoom())
                WorkOnNext(lock);
            else
                m_Changed.wait(lock);
        }
    }

    /// Waits for the next result, working itself as long as there is something to begin. Throws what its work
    /// threw.
    void WaitForNext() {
        std::unique_lock lock(m_Lock);
        const State& next = StateOf(m_Taken);
        while (!next.isDone) {
            if (m_Next < m_Count && HasRoom())
                WorkOnNext(lock);
            else
                m_Changed.wait(lock);
        }
        if (next.failure) std::rethrow_exception(next.failure);
    }

    /// Makes room where the next result was.
    void TakeNext() {
        const std::lock_guard lock(m_Lock);
        StateOf(m_Taken++) = {};
        m_Changed.notify_all();
    }

    /// Nothing is begun from here on.
    void End() {
        const std::lock_guard lock(m_Lock);
        m_Next = m_Count;
        m_Changed.notify_all();
    }

private:
    struct State {
        bool isDone = false;
        std::exception_ptr failure;
    };

    State& StateOf(std::size_t index) { return m_States[index % m_States.size()]; }
    bool HasRoom() const { return m_Next < m_Taken + m_States.size(); }

    void WorkOnNext(std::unique_lock<std::mutex>& lock) {
        const std::size_t index = m_Next++;
        lock.unlock();
        const std::exception_ptr failure = Try(index);
        lock.lock();
        StateOf(index) = {true, failure};
        m_Changed.notify_all();
    }

    std::exception_ptr Try(std::size_t index) const {
        try {
            m_Work(index);
            return nullptr;
        } catch (...) {
            return std::current_exception();
        }
    }

    const std::size_t m_Count;
    const std::function<void(std::size_t)>& m_Work;
    std::mutex m_Lock;
    std::condition_variable m_Changed;
    std::vector<State> m_States; // of what was begun and not taken, by turns
    std::size_t m_Next = 0;      // to begin
    std::size_t m_Taken = 0;
};

/// Threads that help with a row as long as this lives; as many as are to be had.
class Helpers {
public:
    Helpers(Row& row, std::size_t count) : m_Row(row) {
        m_Threads.reserve(count);
        try {
            while (m_Threads.size() < count) m_Threads.emplace_back([&row] { row.Help(); });
        } catch (const std::system_error&) {
            // The others do it all.
        }
    }
    Helpers(const Helpers&) = delete;
    Helpers& operator=(const Helpers&) = delete;
    ~Helpers() { m_Row.End(); }

private:
    Row& m_Row;
    std::vector<std::jthread> m_Threads;
};

} // namespace

std::size_t WaitingResults() {
    return 4 * Processors();
}

void RunInOrder(std::size_t count, const std::function<void(std::size_t)>& work,
                const std::function<void(std::size_t)>& take) {
    Row row(count, work);
    const Helpers helpers(row, std::min(count, Processors()) - (count ? 1 : 0));
    for (std::size_t index = 0; index < count; ++index) {
        row.WaitForNext();
        take(index);
        row.TakeNext();
    }
}

} // namespace ovrin
