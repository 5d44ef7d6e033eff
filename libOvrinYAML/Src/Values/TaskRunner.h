#pragma once

#include <algorithm>
#include <cstddef>
#include <functional>

namespace ovrin_yaml {

/// Carries out task(0), ..., task(count - 1), each once, and waits for them: on several threads, or one after
/// the other, as whoever gives it thinks right. Throws what a task threw, when all are done.
using TaskRunner = std::function<void(std::size_t count, const std::function<void(std::size_t)>& task)>;

/// Calls work(first, end) for neighbouring ranges of `count` things, each of up to `groupSize`: by `run`
/// where there is one and they are many, otherwise one after the other.
template <class Work>
void RunInGroups(const TaskRunner& run, std::size_t count, std::size_t groupSize, const Work& work) {
    constexpr std::size_t kManyGroups = 8;
    const std::size_t groups = (count + groupSize - 1) / groupSize;
    const auto runGroup = [&](std::size_t group) {
        work(group * groupSize, std::min((group + 1) * groupSize, count));
    };
    if (run && groups >= kManyGroups) return run(groups, runGroup);
    for (std::size_t group = 0; group < groups; ++group) runGroup(group);
}

} // namespace ovrin_yaml
