#include "ReadInputs.h"

#include "InputFiles.h"
#include "Thread.h"
#include "TimerStat.h"

namespace {

void ReadOnThreads(TimerStat& parent, const std::vector<InputFile>& inputs) {
    TimerStat timer(parent, "Read base, left and right");
    std::vector<Thread> threads;
    threads.reserve(inputs.size());
    for (const InputFile& input : inputs)
        threads.emplace_back([&input] { ReadYAMLPath(*input.path, *input.objects); });
    for (Thread& thread : threads) thread.Join();
    for (const Thread& thread : threads) thread.CheckForExceptions();
}

} // namespace

void ReadInputs(TimerStat& parent, bool useThreads, const std::vector<InputFile>& inputs) {
    if (useThreads) return ReadOnThreads(parent, inputs);
    for (const InputFile& input : inputs) {
        TimerStat timer(parent, input.timerName);
        ReadYAMLPath(*input.path, *input.objects);
    }
}
