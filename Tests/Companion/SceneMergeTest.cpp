#include "Conflicts/SceneMerge.h"

#include "Diff/RulesReader.h"
#include "Words/Failure.h"

#include <gtest/gtest.h>
#include <sstream>

namespace {

using namespace ovrin;

const std::string kHeader = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";

std::string Lantern(const std::string& fields) {
    return "--- !o!1 &10\nGameObject:\n" + fields;
}

/// A Transform below another.
std::string Below(int id, int father, int order = 0) {
    return "--- !o!4 &" + std::to_string(id) +
           "\nTransform:\n  m_Father: {fileID: " + std::to_string(father) +
           "}\n  m_Order: " + std::to_string(order) + "\n";
}

SceneMerge Merged(const std::string& base, const std::string& ours, const std::string& theirs) {
    return SceneMerge({base.empty() ? "" : kHeader + base, kHeader + ours, kHeader + theirs}, {});
}

std::string FailureOf(const ThreeTexts& texts) {
    try {
        SceneMerge merge(texts, {});
    } catch (const Failure& failure) {
        return failure.what();
    }
    return {};
}

struct SceneMergeTest : testing::Test {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }

    const std::string base = Lantern("  m_Layer: 1\n  m_Name: Lantern\n");
    const std::string ours = Lantern("  m_Layer: 5\n  m_Name: Lamp\n");
    const std::string theirs = Lantern("  m_Layer: 2\n  m_Name: Lantern\n");
    const std::string layer = "10.GameObject.m_Layer";
};

TEST_F(SceneMergeTest, OpenConflictHasTheSideThatIsTaken) {
    SceneMerge merge = Merged(base, ours, theirs);
    for (const auto& [side, value] : {std::pair{Side::Ours, "5"}, {Side::Theirs, "2"}, {Side::Base, "1"}}) {
        merge.Merge({}, side);
        ASSERT_EQ(merge.Open().size(), 1u);
        EXPECT_EQ(merge.Result(),
                  kHeader + Lantern(std::string("  m_Layer: ") + value + "\n  m_Name: Lamp\n"));
    }
}

TEST_F(SceneMergeTest, DecisionSettlesAndOneThatMatchesNothingIsTold) {
    SceneMerge merge = Merged(base, ours, theirs);
    merge.Merge(
        std::vector<Decision>{{"*.GameObject.m_Layer", Side::Theirs}, {"11.GameObject.m_Layer", Side::Ours}});
    EXPECT_TRUE(merge.Open().empty());
    EXPECT_EQ(merge.Result(), kHeader + Lantern("  m_Layer: 2\n  m_Name: Lamp\n"));
    ASSERT_EQ(merge.Unmatched().size(), 1u);
    EXPECT_EQ(merge.Unmatched()[0].path, "11.GameObject.m_Layer");
    merge.Merge();
    EXPECT_EQ(merge.Open().size(), 1u);
}

TEST_F(SceneMergeTest, DecisionsMatchWhateverTheirShapeAndHoweverOftenTheyAreMade) {
    SceneMerge merge = Merged(base, ours, theirs);
    std::vector<Decision> decisions;
    for (const char* path : {"*.*.m_Layer", layer.c_str(), "*.GameObject.*", layer.c_str(), "*.*.m_Name.*",
                             "*.*.m_Tag", "11.*", "*.*.m_Tag"})
        decisions.push_back({path, Side::Theirs});
    merge.Merge(decisions);
    std::vector<std::string> unmatched;
    for (const Decision& decision : merge.Unmatched()) unmatched.push_back(decision.path);
    EXPECT_EQ(unmatched, (std::vector<std::string>{"*.*.m_Name.*", "*.*.m_Tag", "11.*", "*.*.m_Tag"}));
}

TEST_F(SceneMergeTest, EmptyBaseIsAUnion) {
    SceneMerge merge = Merged("", base, theirs + Below(20, 0));
    EXPECT_TRUE(merge.IsBothAdded());
    merge.Merge();
    ASSERT_EQ(merge.Open().size(), 1u);
    EXPECT_EQ(merge.Open()[0].kind, ConflictKind::BothAdded);
    EXPECT_EQ(merge.Result(), kHeader + base + Below(20, 0));
}

/// Ours moves 10 below 20 and theirs 20 below 10; a parent is looked at where both touched the object.
SceneMerge MergedIntoLoop() {
    return Merged(Below(10, 0) + Below(20, 0), Below(10, 20) + Below(20, 0, 1),
                  Below(10, 0, 1) + Below(20, 10));
}

TEST_F(SceneMergeTest, LoopOfParentsStaysOpenAndIsNotInTheResult) {
    SceneMerge merge = MergedIntoLoop();
    merge.Merge();
    ASSERT_EQ(merge.Open().size(), 2u);
    EXPECT_EQ(merge.Open()[0].kind, ConflictKind::ParentLoop);
    EXPECT_EQ(merge.Result(), kHeader + Below(10, 20, 1) + Below(20, 0, 1));
    merge.Merge({}, Side::Theirs);
    EXPECT_EQ(merge.Result(), kHeader + Below(10, 0, 1) + Below(20, 10, 1));
}

TEST_F(SceneMergeTest, LoopIsSettledByTheDecisionsThatEndIt) {
    SceneMerge merge = MergedIntoLoop();
    const std::string path10 = "10.Transform.m_Father", path20 = "20.Transform.m_Father";
    merge.Merge(std::vector<Decision>{{path10, Side::Theirs}});
    EXPECT_TRUE(merge.Open().empty());
    EXPECT_EQ(merge.Result(), kHeader + Below(10, 0, 1) + Below(20, 10, 1));
    merge.Merge(std::vector<Decision>{{path10, Side::Ours}, {path20, Side::Theirs}});
    EXPECT_EQ(merge.Open().size(), 2u);
    EXPECT_EQ(merge.Result(), kHeader + Below(10, 20, 1) + Below(20, 0, 1));
}

TEST_F(SceneMergeTest, FailureTellsTheSideTheObjectAndTheReason) {
    const ThreeTexts texts = {kHeader + base, kHeader + base, kHeader + Lantern("  m_Layer: [\n")};
    const std::string failure = FailureOf(texts);
    EXPECT_TRUE(failure.starts_with("theirs can't be read, at object 10, line 3: ")) << failure;
    EXPECT_TRUE(FailureOf({texts.base, "no scene", texts.base}).starts_with("ours can't be read: "));
    const std::string unescaped =
        kHeader + Lantern("  m_Note: \xC3\xA9\n") + "--- !o!1 &20\nGameObject:\n  m_Layer: 2\n";
    EXPECT_NE(FailureOf({texts.base, unescaped, texts.base}).find("save it again"), std::string::npos);
}

} // namespace
