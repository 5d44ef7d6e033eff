// What holds for every document. The exceptions are the rules' own: a key order that one side moved is lost
// where both sides have a diff of the mapping, as they always have at the root; equal moves of both sides are
// lost in lists and mappings that are merged inside; neither an empty list in place of an empty mapping nor
// the flow flag of a container that stays is a difference.

#include "Merge/DiffMerge.h"
#include "SceneGenerator.h"
#include "Support/Merges.h"
#include "Support/RandomTrees.h"

#include "Reading/ObjectFileReader.h"
#include "Writing/YAMLEmitter.h"

#include <sstream>

namespace {

using namespace merges;
using namespace random_trees;

class Laws : public RulesTest {
protected:
    static constexpr unsigned kSeeds = 3000;

    /// The body of `base` with a merge of two bodies applied; the records of conflicts go to `records`.
    static std::string MergeBodies(const YAMLMapping* base, const YAMLMapping* left, const YAMLMapping* right,
                                   std::string& records) {
        RecordingConflictResolver resolver(TheRules(), ResolveBase);
        const auto* merged = MergeMappingDiffs(YAMLMappingDiff::Diff(TheRules(), base, left),
                                               YAMLMappingDiff::Diff(TheRules(), base, right), resolver);
        YAMLMapping* result = AsMapping(base->Clone());
        merged->Apply(*result);
        records = Records(resolver, false);
        return Show(result);
    }
};

TEST_F(Laws, ADiffAppliedToItsBaseGivesItsDestination) {
    for (unsigned seed = 0; seed < kSeeds; ++seed) {
        RandomTrees trees(seed);
        const YAMLMapping* base = trees.Body();
        const YAMLMapping* dest = trees.Edited(base, {});
        YAMLMapping* result = AsMapping(base->Clone());
        YAMLMappingDiff::Diff(TheRules(), base, dest)->Apply(*result);
        ASSERT_EQ(Show(result), Show(dest)) << "seed " << seed << "\n" << Show(base);
    }
}

TEST_F(Laws, AChangeOfOneSideIsTheMerge) {
    for (unsigned seed = 0; seed < kSeeds; ++seed) {
        RandomTrees trees(seed);
        const YAMLMapping* base = trees.Body();
        const YAMLMapping* edited = trees.Edited(base, {.movesRootKeys = false});
        std::string records;
        ASSERT_EQ(MergeBodies(base, base, edited, records), Show(edited)) << "seed " << seed << "\n"
                                                                          << Show(base);
        ASSERT_EQ(records, "") << "seed " << seed;
        ASSERT_EQ(MergeBodies(base, edited, base, records), Show(edited)) << "seed " << seed << "\n"
                                                                          << Show(base);
        ASSERT_EQ(records, "") << "seed " << seed;
    }
}

TEST_F(Laws, TheSameChangeOfBothSidesIsTheMerge) {
    for (unsigned seed = 0; seed < kSeeds; ++seed) {
        RandomTrees trees(seed);
        const YAMLMapping* base = trees.Body();
        const YAMLMapping* edited =
            trees.Edited(base, {.movesKeys = false, .movesElements = false, .movesRootKeys = false});
        std::string records;
        ASSERT_EQ(MergeBodies(base, edited, edited, records), Show(edited)) << "seed " << seed << "\n"
                                                                            << Show(base);
        ASSERT_EQ(records, "") << "seed " << seed;
    }
}

TEST_F(Laws, TwoChangesMergeWithoutFailureWhateverTheyAre) {
    for (unsigned seed = 0; seed < kSeeds; ++seed) {
        RandomTrees trees(seed);
        const YAMLMapping* base = trees.Body();
        const YAMLMapping *left = trees.Edited(base, {}), *right = trees.Edited(base, {});
        std::string records;
        std::string body;
        ASSERT_EQ(ErrorOf([&] { body = MergeBodies(base, left, right, records); }), "none")
            << "seed " << seed;
        ASSERT_EQ(body.find('~'), std::string::npos) << "no holes stay; seed " << seed;
    }
}

TEST_F(Laws, AWrittenBodyReadsBackTheSame) {
    for (unsigned seed = 0; seed < kSeeds; ++seed) {
        RandomTrees trees(seed);
        const std::string written = ObjectText("--- !o!114 &1\n" + GetYAMLString(*trees.Body()) + "\n");
        ASSERT_EQ(ReadAndWrite(written), written) << "seed " << seed;
    }
}

/// The three files of a generated scene.
struct Scene {
    explicit Scene(const ovrin_bench::SceneOptions& options) {
        std::ostringstream streams[3];
        conflicts =
            ovrin_bench::GenerateScene(options, {streams[0], streams[1], streams[2], nullptr}).conflicts;
        for (int i = 0; i < 3; ++i) texts[i] = streams[i].str();
    }

    std::string texts[3]; // base, left, right
    std::uint64_t conflicts;
};

ovrin_bench::SceneOptions SceneOf(unsigned seed) {
    ovrin_bench::SceneOptions options;
    options.seed = seed;
    options.objects = 60;
    options.edited = 200000;
    options.conflicts = seed % 4;
    return options;
}

TEST_F(Laws, AGeneratedSceneReadsBackTheSame) {
    for (unsigned seed = 0; seed < 40; ++seed)
        for (const std::string& text : Scene(SceneOf(seed)).texts)
            ASSERT_EQ(ReadAndWrite(text), text) << seed;
}

TEST_F(Laws, AGeneratedSceneHasTheConflictsThatWerePutIn) {
    for (unsigned seed = 0; seed < 40; ++seed) {
        const Scene scene(SceneOf(seed));
        OvrinObjects objects[3];
        for (int i = 0; i < 3; ++i) ParseYAMLString(scene.texts[i], objects[i]);
        std::string records;
        MergeBodies(&objects[0].GetMapping(), &objects[1].GetMapping(), &objects[2].GetMapping(), records);
        ASSERT_EQ(static_cast<std::uint64_t>(std::count(records.begin(), records.end(), '\n')),
                  scene.conflicts)
            << "seed " << seed << "\n"
            << records;
    }
}

} // namespace
