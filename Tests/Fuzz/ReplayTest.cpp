#include "MergeCheck.h"
#include "ReaderCheck.h"
#include "SmallChecks.h"
#include "Support/Documents.h"
#include "Support/Program.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin_fuzz;
namespace fs = std::filesystem;

/// What `check` finds in the inputs of a folder, with their names.
template <class Check> std::string FindingsIn(const std::string& corpus, const Check& check) {
    std::string findings;
    for (const fs::directory_entry& entry :
         fs::directory_iterator(OVRIN_SOURCE_DIR "/Fuzz/Corpus/" + corpus)) {
        const std::string finding = check(program::ReadFile(entry.path()));
        if (!finding.empty()) findings += entry.path().filename().string() + ": " + finding + "\n";
    }
    return findings;
}

TEST(Replay, AllWaysToReadGiveTheSame) {
    EXPECT_EQ(FindingsIn("reader", [](const std::string& input) { return CheckReader(FileOfInput(input)); }),
              "");
}

TEST(Replay, AllWaysToReadGiveTheSameMerge) {
    EXPECT_EQ(FindingsIn("merge", [](const std::string& input) { return CheckMerge(TextsOfInput(input)); }),
              "");
}

TEST(Replay, SmallFilesAndCommandLinesObeyTheirLaws) {
    const std::pair<const char*, std::string (*)(std::string_view)> checks[] = {
        {"rules", CheckRules},
        {"resolve", CheckResolve},
        {"typeinfo", CheckTypeInfo},
        {"mergespec", CheckMergeSpec},
        {"commandline", CheckCommandLine}};
    for (const auto& [corpus, check] : checks) EXPECT_EQ(FindingsIn(corpus, check), "") << corpus;
}

} // namespace
