#include "MergeCheck.h"

#include "MergeLaws.h"
#include "MergeRun.h"
#include "ReadInputs.h"
#include "Thread.h"

#include "Reading/ObjectFile.h"
#include "Values/YAMLError.h"

#include <vector>

using namespace ovrin_yaml;

namespace ovrin_fuzz {

namespace {

void ReadPieces(ObjectFile& file) {
    for (std::size_t piece = file.PieceCount(); piece > 0; --piece) file.ReadPiece(piece - 1);
}

/// Each file is finished before the next is begun.
void ReadInTurn(const MergeTexts& texts, ReaderOptions options, MergeFiles& files) {
    ObjectFile base(files.base, options), left(files.left, options), right(files.right, options);
    const auto read = [&](ObjectFile& file, const std::string& text) {
        file.Take(std::string(text));
        file.Cut(&file == &base ? nullptr : &base);
        ReadPieces(file);
        file.Finish();
    };
    read(base, texts.base);
    read(left, texts.left);
    read(right, texts.right);
}

/// All files take each step together, and are read on threads.
void ReadAtOnce(const MergeTexts& texts, ReaderOptions options, MergeFiles& files) {
    ObjectFile base(files.base, options), left(files.left, options), right(files.right, options);
    base.Take(std::string(texts.base));
    base.Cut(nullptr);
    left.Take(std::string(texts.left));
    right.Take(std::string(texts.right));
    for (ObjectFile* file : {&right, &left}) file->Cut(&base);
    std::vector<Thread> threads;
    for (ObjectFile* file : {&right, &base, &left}) threads.emplace_back([file] { ReadPieces(*file); });
    for (Thread& thread : threads) thread.Join();
    for (const Thread& thread : threads) thread.CheckForExceptions();
    for (ObjectFile* file : {&base, &left, &right}) file->Finish();
}

} // namespace

std::string CheckMerge(const MergeTexts& texts) {
    const auto run = [&](auto read, bool fast, bool share, PremergeFrom from = PremergeFrom::Clone,
                         bool onThreads = false) {
        ReaderOptions options = DefaultReaderOptions();
        options.fast = fast;
        options.share = share;
        return RunMerge({[&](MergeFiles& files) { read(texts, options, files); }, from, onThreads});
    };
    const MergeOutcome expected = run(ReadInTurn, false, false, PremergeFrom::Reading);
    const MergeOutcome unshared = run(ReadInTurn, true, false);
    const MergeOutcome inTurn = run(ReadInTurn, true, true);
    const MergeOutcome atOnce = run(ReadAtOnce, true, true, PremergeFrom::Clone, true);
    std::string finding = CompareOutcomes(expected, unshared);
    if (finding.empty()) finding = CompareOutcomes(expected, inTurn);
    if (finding.empty()) finding = CompareOutcomes(expected, atOnce);
    if (finding.empty()) finding = CheckLaws(texts.base, texts.left);
    return finding.empty() ? CheckLaws(texts.base, texts.right) : finding;
}

} // namespace ovrin_fuzz
