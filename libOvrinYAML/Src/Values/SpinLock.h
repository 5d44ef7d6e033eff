#pragma once

#include <atomic>
#include <thread>

namespace ovrin_yaml {

/// A lock of one byte for a few instructions at a time, to be held through std::lock_guard: less than half
/// the price of a mutex where nobody else wants it. A thread that finds it taken gives its processor away.
class SpinLock {
public:
    constexpr SpinLock() = default;
    SpinLock(const SpinLock&) = delete;
    SpinLock& operator=(const SpinLock&) = delete;

    void lock() {
        while (m_IsTaken.test_and_set(std::memory_order_acquire)) std::this_thread::yield();
    }
    void unlock() { m_IsTaken.clear(std::memory_order_release); }

private:
    std::atomic_flag m_IsTaken;
};

} // namespace ovrin_yaml
