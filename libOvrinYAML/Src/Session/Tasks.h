#pragma once

#include "Session/Thread.h"
#include "Values/TaskRunner.h"

namespace ovrin_yaml {

/// Carries out the tasks, as a TaskRunner, on as many threads as the machine has processors, handing them out
/// in their order; one after the other if they are little work.
void RunTasks(std::size_t count, const std::function<void(std::size_t)>& task, bool isLittle);

/// Runs work that is worth it as `threads` has it.
TaskRunner RunnerFor(Threads threads);

} // namespace ovrin_yaml
