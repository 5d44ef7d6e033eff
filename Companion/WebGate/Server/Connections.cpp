#include "WebGate/Server/Connections.h"

#include <sys/socket.h>
#include <utility>

namespace ovrin {

Connections::Connections(std::size_t most) : m_Most(most), m_Threads(most) {}

void Connections::enqueue(std::function<void()> serve) {
    {
        std::unique_lock lock(m_Mutex);
        while (m_Count >= m_Most) {
            // Its thread finds the connection closed, and comes to its end.
            if (!m_Awaited.empty()) ::shutdown(m_Awaited.front(), SHUT_RDWR);
            m_Changed.wait(lock);
        }
        ++m_Count;
    }
    m_Threads.enqueue([this, serve = std::move(serve)] {
        serve();
        const std::lock_guard lock(m_Mutex);
        --m_Count;
        m_Changed.notify_one();
    });
}

void Connections::shutdown() {
    m_Threads.shutdown();
}

Connections::Awaiting::Awaiting(Connections& connections, int socket) : m_Connections(connections) {
    const std::lock_guard lock(m_Connections.m_Mutex);
    m_Place = m_Connections.m_Awaited.insert(m_Connections.m_Awaited.end(), socket);
    m_Connections.m_Changed.notify_one();
}

Connections::Awaiting::~Awaiting() {
    const std::lock_guard lock(m_Connections.m_Mutex);
    m_Connections.m_Awaited.erase(m_Place);
}

} // namespace ovrin
