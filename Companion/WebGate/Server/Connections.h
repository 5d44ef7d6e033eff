#pragma once

#include <condition_variable>
#include <cstddef>
#include <functional>
#include <httplib.h>
#include <list>
#include <mutex>

namespace ovrin {

/// The threads that serve connections, one each. There are so many at most; where another one comes, the
/// one whose request has been awaited for longest is dropped for it: whoever opens connections and says
/// nothing on them, by intent or to have them ready, keeps nobody out.
class Connections : public httplib::TaskQueue {
public:
    explicit Connections(std::size_t most);

    void enqueue(std::function<void()> serve) override;
    void shutdown() override;

    /// While it lives, the request of a connection is awaited.
    class Awaiting {
    public:
        Awaiting(Connections& connections, int socket);
        Awaiting(const Awaiting&) = delete;
        Awaiting& operator=(const Awaiting&) = delete;
        ~Awaiting();

    private:
        Connections& m_Connections;
        std::list<int>::iterator m_Place;
    };

private:
    const std::size_t m_Most;
    httplib::ThreadPool m_Threads;
    std::mutex m_Mutex;
    std::condition_variable m_Changed;
    std::size_t m_Count = 0;
    std::list<int> m_Awaited; // sockets, the oldest first
};

} // namespace ovrin
