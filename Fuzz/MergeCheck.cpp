#include "MergeCheck.h"

#include "MergeLaws.h"
#include "MergeRun.h"

#include <algorithm>

using namespace ovrin_yaml;

namespace ovrin_fuzz {

namespace {

/// Gives few bytes at a time.
ByteSource InSteps(const std::string& text) {
    return [text, at = std::size_t{0}](char* bytes, std::size_t size) mutable {
        constexpr std::size_t kStep = 61;
        const std::size_t count = std::min({kStep, size, text.size() - at});
        std::copy_n(text.data() + at, count, bytes);
        at += count;
        return count;
    };
}

} // namespace

std::string CheckMerge(const MergeTexts& texts) {
    const auto files = [&]() -> std::vector<InputFile> {
        return {TextInput("base", texts.base), TextInput("left", texts.left),
                TextInput("right", texts.right)};
    };
    const auto inSteps = [&]() -> std::vector<InputFile> {
        std::vector<InputFile> inputs = files();
        for (std::size_t i = 1; i < inputs.size(); ++i)
            inputs[i].open = [text = i == 1 ? texts.left : texts.right] { return InSteps(text); };
        return inputs;
    };
    const auto run = [&](bool fast, bool share, Threads threads, Sessions sessions) {
        ReaderOptions options = DefaultReaderOptions();
        options.fast = fast;
        options.share = share;
        options.recognise = false;
        return RunMerge({files, options, threads, sessions});
    };
    const auto runUnbuilt = [&](Threads threads, Sessions sessions) {
        ReaderOptions options = DefaultReaderOptions();
        options.window = 200; // less than many a document
        return RunMerge({inSteps, options, threads, sessions, {}, false});
    };
    const MergeOutcome expected = run(false, false, Threads::None, Sessions::OneEach);
    const MergeOutcome unshared = run(true, false, Threads::None, Sessions::One);
    const MergeOutcome inTurn = run(true, true, Threads::None, Sessions::One);
    const MergeOutcome atOnce = run(true, true, Threads::Everywhere, Sessions::One);
    std::string finding = CompareOutcomes(expected, unshared);
    if (finding.empty()) finding = CompareOutcomes(expected, inTurn);
    if (finding.empty()) finding = CompareOutcomes(expected, atOnce);
    if (finding.empty()) finding = CompareOutcomes(expected, runUnbuilt(Threads::None, Sessions::OneEach));
    if (finding.empty()) finding = CompareOutcomes(expected, runUnbuilt(Threads::Everywhere, Sessions::One));
    if (finding.empty()) finding = CheckLaws(texts.base, texts.left);
    return finding.empty() ? CheckLaws(texts.base, texts.right) : finding;
}

} // namespace ovrin_fuzz
