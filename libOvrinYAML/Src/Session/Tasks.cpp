#include "Session/Tasks.h"

#include <algorithm>
#include <atomic>
#include <thread>
#include <vector>

namespace ovrin_yaml {

void RunTasks(std::size_t count, const std::function<void(std::size_t)>& task, bool isLittle) {
    std::atomic<std::size_t> next = 0;
    const auto work = [&] {
        for (std::size_t i = next++; i < count; i = next++) task(i);
    };
    const std::size_t processors = isLittle ? 1 : std::max(2u, std::thread::hardware_concurrency());
    std::vector<Thread> threads;
    threads.reserve(std::min(count, processors));
    while (threads.size() < std::min(count, processors)) threads.emplace_back(work, isLittle);
    for (Thread& thread : threads) thread.Join();
    for (const Thread& thread : threads) thread.CheckForExceptions();
}

TaskRunner RunnerFor(Threads threads) {
    return [isAlone = threads == Threads::None](std::size_t count,
                                                const std::function<void(std::size_t)>& task) {
        RunTasks(count, task, isAlone);
    };
}

} // namespace ovrin_yaml
