#include "Conflicts/Conflict.h"

#include "Conflicts/ConflictReport.h"
#include "Conflicts/DecisionPath.h"
#include "SceneGenerator.h"
#include "Words/Failure.h"

#include "Reading/ObjectFileReader.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <random>
#include <set>
#include <sstream>

namespace {

using namespace ovrin;

const std::string kHeader = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";

std::string Object(const std::string& id, const std::string& body) {
    return "--- !o!" + id + "\n" + body;
}
std::string Lantern(const std::string& fields) {
    return Object("1 &10", "GameObject:\n" + fields);
}
std::string Below(int id, int father, int order = 0) {
    return Object("4 &" + std::to_string(id), "Transform:\n  m_Father: {fileID: " + std::to_string(father) +
                                                  "}\n  m_Order: " + std::to_string(order) + "\n");
}

struct ConflictKindsTest : testing::Test {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }

    /// "code path: base | ours | theirs" of each conflict.
    static std::string Told(const std::string& base, const std::string& ours, const std::string& theirs) {
        SceneMerge merge({base.empty() ? "" : kHeader + base, kHeader + ours, kHeader + theirs}, {});
        merge.Merge();
        std::string told;
        for (const Conflict& conflict : ConflictWords(merge).DescribeOpen())
            told += std::string(CodeOf(conflict.kind)) + " " + conflict.path + ": " +
                    conflict.WordsOf(Side::Base) + " | " + conflict.WordsOf(Side::Ours) + " | " +
                    conflict.WordsOf(Side::Theirs) + "\n";
        return told;
    }
};

TEST_F(ConflictKindsTest, CodesAndWordsAreDifferent) {
    std::set<std::string> codes, words;
    for (int kind = 0; kind <= static_cast<int>(ConflictKind::KeyOrder); ++kind) {
        codes.insert(CodeOf(static_cast<ConflictKind>(kind)));
        words.insert(WhatHappened(static_cast<ConflictKind>(kind)));
    }
    EXPECT_EQ(codes, (std::set<std::string>{"both-added", "both-changed", "broken-requirement", "key-order",
                                            "parent-loop", "theirs-removed"}));
    EXPECT_EQ(words.size(), codes.size());
}

TEST_F(ConflictKindsTest, ValuesAreToldOfEverySide) {
    EXPECT_EQ(Told(Lantern("  a: 1\n"), Lantern("  a: 2\n"), Lantern("  a: 3\n")),
              "both-changed 10.GameObject.a: 1 | 2 | 3\n");
    EXPECT_EQ(Told(Lantern("  a: 1\n"), Lantern("  a: 1\n  b: 2\n"), Lantern("  a: 1\n  b: 3\n")),
              "both-added 10.GameObject.b: none | 2 | 3\n");
    EXPECT_EQ(Told(Lantern("  a: 1\n  b: 1\n"), Lantern("  a: 1\n  b: 2\n"), Lantern("  a: 1\n")),
              "theirs-removed 10.GameObject.b: 1 | 2 | removed\n");
}

TEST_F(ConflictKindsTest, ObjectsAreToldByWhatWasDoneToThem) {
    const std::string other = Below(20, 0);
    EXPECT_EQ(Told(Lantern("  a: 1\n  b: 1\n") + other, Lantern("  a: 2\n  b: 2\n") + other, other),
              "theirs-removed 10: there | changed a, b | removed\n");
    EXPECT_EQ(Told(other, Lantern("  a: 1\n") + other, Lantern("  a: 2\n") + other).substr(0, 10),
              "both-added");
}

TEST_F(ConflictKindsTest, LoopsAreToldByTheFathersOfBothSides) {
    const std::string told =
        Told(Below(10, 0) + Below(20, 0), Below(10, 20) + Below(20, 0, 1), Below(10, 0, 1) + Below(20, 10));
    EXPECT_EQ(std::ranges::count(told, '\n'), 2);
    EXPECT_TRUE(told.starts_with("parent-loop 10.Transform.m_Father: none | → ")) << told;
}

TEST_F(ConflictKindsTest, SidesAreToldWhereTheirNamesLeaveDoubt) {
    EXPECT_EQ(TellSides({"rebase", "", "main", "3f2a1c9 (Dim\x1b)", ""}),
              "ours is main, what you rebase onto; theirs is 3f2a1c9 (Dim\\x1b), your own commit, which is "
              "put on top of it\n");
    EXPECT_EQ(TellSides({"stash", "", "", "", ""}),
              "ours is what you have checked out; theirs is what you had put aside\n");
    for (const char* action : {"", "merge", "unknown"}) EXPECT_EQ(TellSides({action, "", "a", "b", ""}), "");
    for (const char* action : {"cherry-pick", "revert", "am", "graft", "unshelve"})
        EXPECT_NE(TellSides({action, "", "a", "b", ""}), "");
    EXPECT_EQ(CountOpen(1) + CountOpen(0), "1 open conflict0 open conflicts");
}

struct Merged : SceneMerge {
    explicit Merged(const ThreeTexts& texts) : SceneMerge(texts, {}, {}, ovrin_yaml::Threads::None) {
        Merge();
    }
};

/// Merges of generated scenes, which both sides edited in many ways.
struct SceneMergeLaws : testing::TestWithParam<std::uint64_t> {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }

    SceneMergeLaws() {
        std::ostringstream base, left, right;
        ovrin_bench::GenerateScene({.seed = GetParam(), .objects = 120, .edited = 200'000, .conflicts = 12},
                                   {base, left, right, nullptr});
        texts = {base.str(), right.str(), left.str()};
    }
    /// A side for each open conflict.
    static std::vector<Decision> Decisions(const SceneMerge& merge, std::mt19937& random) {
        std::vector<Decision> decisions;
        for (const OpenConflict& open : merge.Open())
            decisions.push_back({DecisionPath(open.path), random() % 2 ? Side::Ours : Side::Theirs});
        return decisions;
    }

    ThreeTexts texts;
};

TEST_P(SceneMergeLaws, SideThatChangedNothingLeavesTheOther) {
    for (const std::string& side : {texts.ours, texts.theirs})
        for (const ThreeTexts& same :
             {ThreeTexts{texts.base, texts.base, side}, {texts.base, side, texts.base}}) {
            const Merged merge(same);
            EXPECT_TRUE(merge.Open().empty());
            EXPECT_TRUE(merge.Result() == side);
        }
}

/// Elements of lists that both sides moved in the same way may stand elsewhere.
TEST_P(SceneMergeLaws, SidesThatDidTheSameHaveNoConflict) {
    const auto lines = [](const std::string& text) {
        std::istringstream stream(text);
        std::multiset<std::string> all;
        for (std::string line; std::getline(stream, line);) all.insert(line);
        return all;
    };
    for (const std::string& side : {texts.ours, texts.theirs}) {
        const Merged merge({texts.base, side, side});
        EXPECT_TRUE(merge.Open().empty());
        EXPECT_TRUE(lines(merge.Result()) == lines(side));
    }
}

TEST_P(SceneMergeLaws, OrderOfDecisionsChangesNothing) {
    std::mt19937 random(1);
    Merged merge(texts);
    ASSERT_GE(merge.Open().size(), 10u);
    std::vector<Decision> decisions = Decisions(merge, random);
    merge.Merge(decisions);
    EXPECT_TRUE(merge.Open().empty());
    EXPECT_TRUE(merge.Unmatched().empty());
    const std::string result = merge.Result();
    std::ranges::reverse(decisions);
    merge.Merge(decisions);
    EXPECT_TRUE(merge.Result() == result);
}

TEST_P(SceneMergeLaws, DecidingForASideIsTakingIt) {
    Merged merge(texts);
    for (const Side side : {Side::Ours, Side::Theirs, Side::Base}) {
        merge.Merge();
        std::vector<Decision> decisions;
        for (const OpenConflict& open : merge.Open()) decisions.push_back({DecisionPath(open.path), side});
        merge.Merge({}, side);
        const std::string taken = merge.Result();
        merge.Merge(decisions);
        EXPECT_TRUE(merge.Result() == taken) << SideName(side);
    }
}

TEST_P(SceneMergeLaws, WithoutDecisionsAllIsAsBefore) {
    std::mt19937 random(2);
    Merged merge(texts);
    const std::string before = merge.Result(), conflicts = ConflictsToJson(merge).dump();
    std::vector<Decision> decisions = Decisions(merge, random);
    const std::size_t all = decisions.size();
    while (!decisions.empty()) {
        decisions.pop_back();
        merge.Merge(decisions);
        EXPECT_EQ(merge.Open().size() + decisions.size(), all);
    }
    EXPECT_TRUE(merge.Result() == before);
    EXPECT_EQ(ConflictsToJson(merge).dump(), conflicts);
}

TEST_P(SceneMergeLaws, ConflictsAreThoseOfTheExchangedSides) {
    const Merged merge(texts), exchanged({texts.base, texts.theirs, texts.ours});
    std::set<ovrin_yaml::Path> paths, others;
    for (const OpenConflict& open : merge.Open())
        if (open.kind == ConflictKind::BothChanged) paths.insert(open.path);
    for (const OpenConflict& open : exchanged.Open())
        if (open.kind == ConflictKind::BothChanged) others.insert(open.path);
    EXPECT_TRUE(paths == others);
}

INSTANTIATE_TEST_SUITE_P(Scenes, SceneMergeLaws, testing::Values(1, 2, 3));

} // namespace
