#pragma once

#include <cstddef>
#include <functional>
#include <optional>
#include <utility>
#include <vector>

namespace ovrin {

/// How many results of ForEachInOrder may wait for those before them.
std::size_t WaitingResults();

/// Calls work(index) for the indexes from 0 to `count` on all processors, and take(index) for each on this
/// thread, in their order, once its work is done. No work begins that is WaitingResults() or more ahead of
/// what was taken. The first exception in order, of either, ends it: what has begun is waited for, the rest
/// is left.
void RunInOrder(std::size_t count, const std::function<void(std::size_t)>& work,
                const std::function<void(std::size_t)>& take);

/// Calls take(index, make(index)) in the same way: results are made on all processors, any number at the same
/// time, and come in their order. Few of them are kept at a time.
template <class Make, class Take> void ForEachInOrder(std::size_t count, const Make& make, const Take& take) {
    using Result = decltype(make(std::size_t{}));
    std::vector<std::optional<Result>> results(WaitingResults());
    const auto place = [&](std::size_t index) -> auto& {
        return results[index % results.size()];
    };
    RunInOrder(
        count, [&](std::size_t index) { place(index).emplace(make(index)); },
        [&](std::size_t index) {
            Result result = std::move(*place(index));
            place(index).reset();
            take(index, std::move(result));
        });
}

} // namespace ovrin
