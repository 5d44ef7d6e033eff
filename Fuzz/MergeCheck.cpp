#include "MergeCheck.h"

#include "MergeRun.h"
#include "ReadInputs.h"

#include "Document/ObjectFile.h"
#include "Document/YAMLError.h"

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

/// All files take each step together.
void ReadAtOnce(const MergeTexts& texts, ReaderOptions options, MergeFiles& files) {
    ObjectFile base(files.base, options), left(files.left, options), right(files.right, options);
    base.Take(std::string(texts.base));
    base.Cut(nullptr);
    left.Take(std::string(texts.left));
    right.Take(std::string(texts.right));
    for (ObjectFile* file : {&right, &left}) file->Cut(&base);
    for (ObjectFile* file : {&right, &base, &left}) ReadPieces(*file);
    for (ObjectFile* file : {&base, &left, &right}) file->Finish();
}

} // namespace

std::string CheckMerge(const MergeTexts& texts) {
    const auto run = [&](auto read, bool fast, bool share, PremergeFrom from = PremergeFrom::Clone) {
        ReaderOptions options = DefaultReaderOptions();
        options.fast = fast;
        options.share = share;
        return RunMerge([&](MergeFiles& files) { read(texts, options, files); }, from);
    };
    const MergeOutcome expected = run(ReadInTurn, false, false, PremergeFrom::Reading);
    const MergeOutcome unshared = run(ReadInTurn, true, false);
    const MergeOutcome inTurn = run(ReadInTurn, true, true);
    const MergeOutcome atOnce = run(ReadAtOnce, true, true);
    std::string finding = CompareOutcomes(expected, unshared);
    if (finding.empty()) finding = CompareOutcomes(expected, inTurn);
    return finding.empty() ? CompareOutcomes(expected, atOnce) : finding;
}

} // namespace ovrin_fuzz
