#include "WebGate/Server/OpenPages.h"

#include <string>

namespace ovrin {

namespace {

constexpr std::size_t kMostPages = 16;

} // namespace

bool OpenPages::Enter() {
    const std::lock_guard lock(m_Mutex);
    if (m_Count >= kMostPages) return false;
    m_Model.Tell({"pages", std::to_string(++m_Count)});
    return true;
}

void OpenPages::Leave() {
    const std::lock_guard lock(m_Mutex);
    m_Model.Tell({"pages", std::to_string(--m_Count)});
}

} // namespace ovrin
