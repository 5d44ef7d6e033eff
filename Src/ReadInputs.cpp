#include "ReadInputs.h"

#include "CommandSettings.h"
#include "FileUtils.h"
#include "InputFiles.h"
#include "Thread.h"
#include "TimerStat.h"

#include "Repair/ObjectTraits.h"

#include <algorithm>
#include <atomic>
#include <deque>
#include <exception>
#include <functional>
#include <optional>
#include <thread>

using namespace ovrin_yaml;

namespace {

/// A file that is being read along with others, and what went wrong with it.
struct FileInWork {
    /// What has no size may be a pipe. One program may fill several of them, in an order of its own, so each
    /// is taken on a thread of its own, which begins at once.
    FileInWork(const InputFile& input, ReaderOptions options)
        : path(*input.path), file(*input.objects, options) {
        if (FileSize(path) == 0) m_Stream.emplace([this] { TakeHere(); });
    }

    /// Gets hold of the bytes.
    void Take() {
        if (m_Stream)
            m_Stream->Join();
        else
            TakeHere();
    }

    /// Takes a step of reading, unless an earlier one failed.
    template <class Step> void Try(const Step& step) {
        if (failure) return;
        try {
            WithFileName(path, step);
        } catch (...) {
            failure = std::current_exception();
        }
    }

    const std::string& path;
    ObjectFile file;
    std::exception_ptr failure;

private:
    void TakeHere() {
        Try([this] { TakeFile(path, file); });
    }

    std::optional<Thread> m_Stream;
};

/// Below this size of all files together, threads cost more than they bring.
constexpr std::size_t kLittleWork = std::size_t{1} << 20;

bool IsLittleWork(const std::vector<InputFile>& inputs) {
    std::size_t bytes = 0;
    for (const InputFile& input : inputs) bytes += FileSize(*input.path);
    return bytes < kLittleWork;
}

/// Carries out the tasks on as many threads as the machine has processors, handing them out in their order.
void RunTasks(const std::vector<std::function<void()>>& tasks, bool isLittle) {
    std::atomic<std::size_t> next = 0;
    const auto work = [&] {
        for (std::size_t i = next++; i < tasks.size(); i = next++) tasks[i]();
    };
    const std::size_t processors = isLittle ? 1 : std::max(2u, std::thread::hardware_concurrency());
    const std::size_t count = std::min(tasks.size(), processors);
    std::vector<Thread> threads;
    threads.reserve(count);
    while (threads.size() < count) threads.emplace_back(work, isLittle);
    for (Thread& thread : threads) thread.Join();
    for (const Thread& thread : threads) thread.CheckForExceptions();
}

void ReadPieces(FileInWork& work) {
    for (std::size_t piece = 0; piece < work.file.PieceCount(); ++piece) work.file.ReadPiece(piece);
}

/// First the bytes of all files. Then the others are cut along the first; by then it is known which of its
/// objects they want. All pieces are read, in any order, and last the objects are put together in the order
/// of the files.
void ReadOnThreads(TimerStat& parent, const std::vector<InputFile>& inputs, ReaderOptions options) {
    TimerStat timer(parent, "Read base, left and right");
    std::deque<FileInWork> files;
    for (const InputFile& input : inputs) files.emplace_back(input, options);
    FileInWork& first = files.front();

    std::vector<std::function<void()>> takes, cuts, pieces;
    for (FileInWork& work : files) {
        takes.emplace_back([&] {
            work.Take();
            if (&work == &first) work.Try([&] { work.file.Cut(nullptr); });
        });
        if (&work != &first) cuts.emplace_back([&] { work.Try([&] { work.file.Cut(&first.file); }); });
    }
    const bool isLittle = IsLittleWork(inputs);
    RunTasks(takes, isLittle);
    RunTasks(cuts, isLittle);
    for (FileInWork& work : files)
        for (std::size_t piece = 0; !work.failure && piece < work.file.PieceCount(); ++piece)
            pieces.emplace_back([&work, piece] { work.file.ReadPiece(piece); });
    RunTasks(pieces, isLittle);

    for (FileInWork& work : files) work.Try([&] { work.file.Finish(); });
    for (const FileInWork& work : files)
        if (work.failure) std::rethrow_exception(work.failure);
}

void ReadInOrder(TimerStat& parent, const std::vector<InputFile>& inputs, ReaderOptions options) {
    std::deque<FileInWork> files;
    for (const InputFile& input : inputs) files.emplace_back(input, options);
    for (std::size_t i = 0; i < inputs.size(); ++i) {
        TimerStat timer(parent, inputs[i].timerName);
        FileInWork& work = files[i];
        work.Take();
        work.Try([&] {
            work.file.Cut(i == 0 ? nullptr : &files.front().file);
            ReadPieces(work);
            work.file.Finish();
        });
        if (work.failure) std::rethrow_exception(work.failure);
    }
}

} // namespace

RulesAndTypes SetupRulesAndTypes(TimerStat& root, TimerStat& reading, const std::string& rulesFile,
                                 const std::string& typeInfoFile) {
    RulesAndTypes read;
    {
        TimerStat timer(reading, "Reading unique keys");
        read.rules = SetupRules(rulesFile);
    }
    if (typeInfoFile == kDefaultTypeInfoFile) return read;
    TimerStat timer(root, "Read type info");
    read.types = SetupTypeInfo(typeInfoFile);
    return read;
}

ReaderOptions DefaultReaderOptions() {
    ReaderOptions options;
    options.inspect = InspectObject;
    // Pre-processing changes them in every file.
    options.unshared = kHasTransitions;
    return options;
}

void ReadInputs(TimerStat& parent, bool useThreads, const std::vector<InputFile>& inputs,
                ReaderOptions options) {
    if (useThreads)
        ReadOnThreads(parent, inputs, options);
    else
        ReadInOrder(parent, inputs, options);
}
