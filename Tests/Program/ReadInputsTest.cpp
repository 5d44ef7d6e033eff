#include "InputFiles.h"
#include "MergeRun.h"
#include "RulesAndTypes.h"
#include "SceneGenerator.h"
#include "Support/Diffs.h"
#include "Support/Program.h"

#include <sstream>

namespace {

using namespace ovrin_fuzz;
using namespace ovrin_yaml;

/// Merges of three files in a directory.
class ReadInputsTest : public diffs::RulesTest {
protected:
    void Write(const ovrin_bench::SceneOptions& options) {
        std::ostringstream base, left, right;
        ovrin_bench::GenerateScene(options, {base, left, right, nullptr});
        m_Directory.Write("base", base.str());
        m_Directory.Write("left", left.str());
        m_Directory.Write("right", right.str());
    }

    MergeOutcome Merge(bool useThreads, ReaderOptions options) const {
        const auto files = [&]() -> std::vector<InputFile> {
            return {FileInput(m_Directory.Path() / "base"), FileInput(m_Directory.Path() / "left"),
                    FileInput(m_Directory.Path() / "right")};
        };
        return RunMerge({files, options, ThreadsOf(useThreads), Sessions::One, {}, !options.recognise});
    }

    /// Of all options and both orders; the first difference from the library's reading in turn.
    std::string CompareAll() const {
        ReaderOptions options = DefaultReaderOptions();
        options.fast = options.share = options.recognise = false;
        const MergeOutcome expected = Merge(false, options);
        std::string difference;
        for (const int choice : {1, 2, 3, 4, 5, 6, 7, 11, 15}) {
            options.fast = choice & 1;
            options.share = choice & 2;
            options.recognise = choice & 8;
            difference += CompareOutcomes(expected, Merge(choice & 4, options));
        }
        return difference;
    }

    program::WorkingDirectory m_Directory;
};

TEST_F(ReadInputsTest, NeitherTheReaderNorSharingNorThreadsChangeAMerge) {
    using Options = ovrin_bench::SceneOptions;
    const Options scenes[] = {
        {.size = 700000, .edited = 20000, .conflicts = 5},
        {.mode = Options::Mode::Disjoint, .objects = 300, .edited = 1000000},
        {.mode = Options::Mode::Conflicts, .conflicts = 30},
        {.mode = Options::Mode::Remove, .objects = 300, .edited = 100000},
        {.mode = Options::Mode::Add, .objects = 300, .edited = 100000},
    };
    for (const Options& scene : scenes) {
        Write(scene);
        EXPECT_EQ(Merge(true, DefaultReaderOptions()).failure, "none");
        EXPECT_EQ(CompareAll(), "") << "mode " << static_cast<int>(scene.mode);
    }
}

TEST_F(ReadInputsTest, NothingDependsOnHowManyObjectsAreEdited) {
    for (std::uint64_t percent = 0; percent <= 100; percent += 10) {
        Write({.seed = percent, .objects = 200, .edited = percent * 10000});
        EXPECT_EQ(CompareAll(), "") << percent;
    }
}

/// Big enough to be read in parts and in windows.
TEST_F(ReadInputsTest, BigFilesAreReadAsSmallOnesAre) {
    for (const std::uint64_t share : {1000, 500000}) {
        Write({.size = 4500000, .edited = share});
        ReaderOptions options = DefaultReaderOptions();
        const MergeOutcome outcome = Merge(true, options);
        EXPECT_EQ(outcome.failure, "none");
        EXPECT_EQ(CompareOutcomes(outcome, Merge(false, options)), "");
        options.share = options.recognise = false;
        EXPECT_EQ(CompareOutcomes(outcome, Merge(true, options)), "");
    }
}

TEST_F(ReadInputsTest, TheFirstFailureInTheOrderOfTheFilesIsReportedWhateverTheWay) {
    const std::string good = diffs::ObjectText("--- !o!1 &1\na: b\n"), early = "no signature",
                      late = diffs::ObjectText("--- !o!1 &1\na: b\n--- !o!1 &2\n- c\n");
    for (const auto& [base, left, right] :
         {std::array{good, late, early}, {late, early, good}, {good, good, late}}) {
        m_Directory.Write("base", base);
        m_Directory.Write("left", left);
        m_Directory.Write("right", right);
        EXPECT_NE(Merge(true, DefaultReaderOptions()).failure, "none");
        EXPECT_EQ(CompareAll(), "");
    }
}

} // namespace
