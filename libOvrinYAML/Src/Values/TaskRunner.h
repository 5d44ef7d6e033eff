#pragma once

#include <cstddef>
#include <functional>

namespace ovrin_yaml {

/// Carries out task(0), ..., task(count - 1), each once, and waits for them: on several threads, or one after
/// the other, as whoever gives it thinks right. Throws what a task threw, when all are done.
using TaskRunner = std::function<void(std::size_t count, const std::function<void(std::size_t)>& task)>;

} // namespace ovrin_yaml
