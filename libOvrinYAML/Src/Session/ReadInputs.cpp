#include "Session/ReadInputs.h"

#include "Reading/ObjectFile.h"
#include "Repair/ObjectTraits.h"
#include "Session/MergeError.h"
#include "Session/StageWatcher.h"
#include "Session/Tasks.h"

#include <deque>
#include <exception>
#include <functional>
#include <new>
#include <optional>
#include <utility>
#include <vector>

namespace ovrin_yaml {

namespace {

/// Takes a step of reading a file. What it throws is thrown again with the name of the file, but for
/// std::bad_alloc: no file is at fault.
template <class Step> void WithFileName(const std::string& name, const Step& step) {
    const auto fail = [&](const char* fault, const YAMLError& reason) {
        throw MergeError(MergeError::Stage::Read, name, reason,
                         "Error parsing file '" + name + "'" + fault + ": " + reason.what());
    };
    try {
        step();
    } catch (const YAMLError& error) {
        fail("", error);
    } catch (const std::bad_alloc&) {
        throw;
    } catch (const std::exception& error) {
        fail(" caught unknown exception", YAMLError(error.what()));
    }
}

/// A file that is being read along with others, and what went wrong with it.
struct FileInWork {
    /// What has no size may be a pipe. One program may fill several of them, in an order of its own, so each
    /// is taken on a thread of its own, which begins at once.
    FileInWork(const FileReading& reading, ReaderOptions options)
        : input(*reading.input), file(*reading.objects, options) {
        if (input.size == 0) m_Stream.emplace([this] { TakeHere(); });
    }

    /// Gets hold of the bytes on all threads, where that can be done; otherwise Take will.
    void TakeInParts() {
        if (!input.openParts) return;
        Try([this] {
            std::optional<CutText> text =
                ReadInParts(input.openParts(), input.size, RunnerFor(Threads::Everywhere));
            if (!text) return;
            file.TakeCut(std::move(*text));
            m_IsTaken = true;
        });
    }

    /// Gets hold of the bytes, as far as they are wanted ahead of the first file's.
    void Take(bool isFirst) {
        if (m_IsTaken) return;
        if (m_Stream)
            m_Stream->Join();
        else if (isFirst || !input.open)
            TakeHere();
    }

    /// Afterwards, and when the first file is cut.
    void CutAlong(ObjectFile& first) {
        Try([&] {
            if (input.open && file.TakeAlong(input.open(), input.size, first)) return;
            if (input.open) file.Take(input.take());
            file.Cut(&first);
        });
    }

    /// Takes a step of reading, unless an earlier one failed.
    template <class Step> void Try(const Step& step) {
        if (failure) return;
        try {
            WithFileName(input.name, step);
        } catch (...) {
            failure = std::current_exception();
        }
    }

    const InputFile& input;
    ObjectFile file;
    std::exception_ptr failure;

private:
    void TakeHere() {
        Try([this] { file.Take(input.take()); });
    }

    std::optional<Thread> m_Stream;
    bool m_IsTaken = false;
};

void RunAll(const std::vector<std::function<void()>>& tasks, bool isLittle) {
    RunTasks(
        tasks.size(), [&](std::size_t i) { tasks[i](); }, isLittle);
}

void ReadPieces(FileInWork& work) {
    const std::size_t count = work.file.MakePieces();
    for (std::size_t piece = 0; piece < count; ++piece) work.file.ReadPiece(piece);
}

/// First the bytes of all files. Then the others are cut along the first; by then it is known which of its
/// objects they want. All pieces are read, in any order, and last the objects of each file are put together.
void ReadOnThreads(std::deque<FileInWork>& files, bool isLittle, StageWatcher* watcher) {
    const WatchedStep step(watcher, "Read base, left and right");
    FileInWork& first = files.front();
    std::vector<std::function<void()>> takes, cuts, pieces, ends;
    for (FileInWork& work : files) {
        takes.emplace_back([&] {
            work.Take(&work == &first);
            if (&work == &first) work.Try([&] { work.file.Cut(nullptr); });
        });
        if (&work != &first) cuts.emplace_back([&] { work.CutAlong(first.file); });
    }
    if (!isLittle) first.TakeInParts();
    RunAll(takes, isLittle);
    RunAll(cuts, isLittle);
    for (FileInWork& work : files) {
        const std::size_t count = work.failure ? 0 : work.file.MakePieces();
        for (std::size_t piece = 0; piece < count; ++piece)
            pieces.emplace_back([&work, piece] { work.file.ReadPiece(piece); });
    }
    for (FileInWork& work : files) ends.emplace_back([&work] { work.Try([&] { work.file.Finish(); }); });
    RunAll(pieces, isLittle);
    RunAll(ends, isLittle);
    for (const FileInWork& work : files)
        if (work.failure) std::rethrow_exception(work.failure);
}

void CutAll(std::deque<FileInWork>& files) {
    FileInWork& first = files.front();
    for (FileInWork& work : files) {
        work.Take(&work == &first);
        if (&work == &first)
            work.Try([&] { work.file.Cut(nullptr); });
        else
            work.CutAlong(first.file);
    }
}

/// All are cut in the first step, since it depends on the others what of the first must be read.
void ReadInOrder(std::deque<FileInWork>& files, const std::vector<FileReading>& readings,
                 StageWatcher* watcher) {
    for (std::size_t i = 0; i < files.size(); ++i) {
        const WatchedStep step(watcher, readings[i].step);
        if (i == 0) CutAll(files);
        FileInWork& work = files[i];
        work.Try([&] {
            ReadPieces(work);
            work.file.Finish();
        });
        if (work.failure) std::rethrow_exception(work.failure);
    }
}

} // namespace

ReaderOptions DefaultReaderOptions() {
    ReaderOptions options;
    options.inspect = InspectObject;
    // Pre-processing changes them in every file.
    options.unshared = kHasTransitions;
    options.recognise = true;
    return options;
}

bool IsLittleWork(const std::vector<FileReading>& readings, Threads threads) {
    constexpr std::size_t kLittle = std::size_t{1} << 20;
    std::size_t bytes = 0;
    for (const FileReading& reading : readings) bytes += reading.input->size;
    return threads != Threads::Everywhere && bytes < kLittle;
}

void ReadInputs(const std::vector<FileReading>& readings, Threads threads, StageWatcher* watcher,
                ReaderOptions options) {
    std::deque<FileInWork> files;
    for (const FileReading& reading : readings) files.emplace_back(reading, options);
    if (threads == Threads::None)
        ReadInOrder(files, readings, watcher);
    else
        ReadOnThreads(files, IsLittleWork(readings, threads), watcher);
}

} // namespace ovrin_yaml
