#include "Settle/SettleSession.h"

#include "ErrorOf.h"
#include "OpenScenes.h"
#include "Settle/Steps.h"
#include "Settle/Wanted.h"
#include "Words/Failure.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

namespace {

using namespace open_scenes;

/// A GameObject of id 10 with its Transform 11, which stands below the Transform of 20, "Harbour".
std::string Lantern(int layer, const std::string& name, int range) {
    return kHeader + "--- !o!1 &10\nGameObject:\n  m_Component:\n  - component: {fileID: 11}\n  m_Layer: " +
           std::to_string(layer) + "\n  m_Name: " + name + "\n  m_Range: " + std::to_string(range) +
           "\n--- !o!4 &11\nTransform:\n  m_GameObject: {fileID: 10}\n  m_Father: {fileID: 21}\n" +
           "--- !o!1 &20\nGameObject:\n  m_Component:\n  - component: {fileID: 21}\n  m_Layer: " +
           std::to_string(layer + 1) + "\n  m_Name: Harbour\n" +
           "--- !o!4 &21\nTransform:\n  m_GameObject: {fileID: 20}\n  m_Children:\n  - {fileID: 11}\n" +
           "  m_Father: {fileID: 0}\n";
}

std::string Transform(int id, int father, const std::string& children, int order = 0) {
    return "--- !o!4 &" + std::to_string(id) + "\nTransform:\n  m_Children:" + children +
           "\n  m_Father: {fileID: " + std::to_string(father) + "}\n  m_Order: " + std::to_string(order) +
           "\n";
}

struct SettleSessionTest : testing::Test {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }
    SettleSessionTest() { sessions.push_back(SessionOf(texts)); }
    SettleSession& session() { return *sessions[0]; }
    void Set(const std::string& text) {
        const std::vector<Wanted> wanted = {ParseWanted(text)};
        DecideWanted(sessions, wanted);
    }

    // Open: the layers of 10 and 20, and the range.
    const ThreeTexts texts = {Lantern(1, "Lantern", 1), Lantern(5, "Lamp", 2), Lantern(2, "Lantern", 3)};
    std::vector<std::unique_ptr<SettleSession>> sessions;
};

TEST_F(SettleSessionTest, DecisionsAreStepsThatAreTakenBack) {
    EXPECT_EQ(session().Open().size(), 3);
    session().Decide({{"10.GameObject.m_Range", Side::Theirs}, {"*.GameObject.m_Layer", Side::Base}});
    EXPECT_TRUE(session().IsSettled());
    session().Decide({{"10.GameObject.m_Layer", Side::Ours}});
    EXPECT_NE(session().Result().find("m_Layer: 5\n  m_Name: Lamp\n  m_Range: 3"), std::string::npos);
    EXPECT_TRUE(session().Undo());
    EXPECT_NE(session().Result().find("m_Layer: 1\n  m_Name: Lamp\n  m_Range: 3"), std::string::npos);
    EXPECT_TRUE(session().Undo());
    EXPECT_EQ(session().Open().size(), 3);
    EXPECT_FALSE(session().Undo());
}

TEST_F(SettleSessionTest, StepsGoBackAndForthOverAllScenesUntilAnotherIsMade) {
    sessions.push_back(SessionOf(texts));
    BeginStep(sessions);
    TakeSide(sessions, Side::Theirs, "");
    BeginStep(sessions);
    sessions[1]->Decide({{"10.GameObject.m_Range", Side::Ours}});
    const std::string result = sessions[1]->Result();
    EXPECT_TRUE(UndoStep(sessions));
    EXPECT_TRUE(session().IsSettled());
    EXPECT_TRUE(UndoStep(sessions));
    EXPECT_EQ(session().Open().size(), 3);
    EXPECT_FALSE(UndoStep(sessions));
    EXPECT_TRUE(RedoStep(sessions) && RedoStep(sessions));
    EXPECT_EQ(sessions[1]->Result(), result);
    UndoStep(sessions);
    BeginStep(sessions);
    session().Decide({{"10.GameObject.m_Range", Side::Base}});
    EXPECT_FALSE(RedoStep(sessions));
}

TEST_F(SettleSessionTest, WhatMatchesNothingDecidesNothing) {
    const auto unmatched =
        session().Decide({{"10.GameObject.m_Range", Side::Ours}, {"10.GameObject.m_None", Side::Ours}});
    ASSERT_EQ(unmatched.size(), 1);
    EXPECT_EQ(unmatched[0].path, "10.GameObject.m_None");
    EXPECT_TRUE(session().Decisions().empty());
    EXPECT_THROW(Set("10.GameObject.m_None=ours"), Failure);
    EXPECT_THROW(Set("10.GameObject.m_Range=mine"), Failure);
    EXPECT_THROW(TakeSide(sessions, Side::Ours, "Harbour/Nothing"), Failure);
}

TEST_F(SettleSessionTest, ConflictIsKnownByItsNameInAnyVersion) {
    for (const char* name : {"Harbour/Lamp.m_Range", "Harbour/Lantern.m_Range", "10.m_Range"}) {
        Set(std::string(name) + "=theirs");
        EXPECT_EQ(session().Open().size(), 2) << name;
        session().Undo();
    }
}

TEST_F(SettleSessionTest, NameWithSeveralMeaningsIsTold) {
    sessions.push_back(SessionOf(texts));
    EXPECT_THROW(Set("Harbour/Lamp.m_Range=ours"), Failure);
    EXPECT_THROW(Set("10.GameObject.m_Range=ours"), Failure);
    Set("*.GameObject.m_Layer=ours");
    EXPECT_EQ(sessions[1]->Open().size(), 1);
}

TEST_F(SettleSessionTest, SideIsTakenForOpenConflictsUnderANameAlone) {
    EXPECT_EQ(TakeSide(sessions, Side::Theirs, "Harbour/Lamp"), 2);
    ASSERT_EQ(session().Open().size(), 1);
    EXPECT_EQ(TakeSide(sessions, Side::Ours, "Harbour"), 1);
    // What one side alone changed, the name, stays.
    EXPECT_NE(session().Result().find("m_Layer: 2\n  m_Name: Lamp\n  m_Range: 3"), std::string::npos);
    const std::vector<SettleSession::Met> met = session().Conflicts();
    ASSERT_EQ(met.size(), 3);
    EXPECT_EQ(met[0].decided, Side::Ours); // Harbour stands ahead of what is in it
    EXPECT_EQ(met[1].decided, Side::Theirs);
}

TEST_F(SettleSessionTest, ProgressIsTakenUpWhereItWasLeft) {
    const auto taken = SessionOf(texts, {{{"10.GameObject.m_Range", Side::Theirs}}, 2, {{1, 1}}});
    EXPECT_EQ(taken->Open().size(), 2);
    EXPECT_EQ(taken->Conflicts().size(), 3);
    EXPECT_EQ(taken->Left(), session().Result());
}

TEST_F(SettleSessionTest, BothAddedIsSettledOnceItWasLookedThrough) {
    const auto added = SessionOf({"", Lantern(1, "Lantern", 1), Lantern(1, "Lantern", 1)});
    EXPECT_TRUE(added->Open().empty());
    EXPECT_FALSE(added->IsSettled());
    added->TakeAll(Side::Ours, [](const OpenConflict&) { return true; });
    EXPECT_TRUE(added->IsSettled());
}

// Ours moves 10 below 20 and theirs 20 below 10.
TEST_F(SettleSessionTest, LoopOfParentsIsSettledWithItsListsOfChildren) {
    const std::string none = " []", has10 = " [{fileID: 10}]", has20 = " [{fileID: 20}]";
    const auto loop = SessionOf({kHeader + Transform(10, 0, none) + Transform(20, 0, none),
                                 kHeader + Transform(10, 20, none) + Transform(20, 0, has10, 1),
                                 kHeader + Transform(10, 0, has20, 1) + Transform(20, 10, none)});
    EXPECT_EQ(loop->Open().size(), 2);
    const auto all = [](const OpenConflict&) { return true; };
    loop->TakeAll(Side::Ours, all);
    EXPECT_TRUE(loop->IsSettled());
    EXPECT_EQ(loop->Result(), kHeader + Transform(10, 20, none, 1) + Transform(20, 0, has10, 1));
    loop->Undo();
    loop->TakeAll(Side::Base, all);
    EXPECT_EQ(loop->Result(), kHeader + Transform(10, 0, none, 1) + Transform(20, 0, none, 1));
}

// Theirs removes the lantern, 10 and 11, with its place below 21; ours changes 10 alone.
TEST_F(SettleSessionTest, ObjectIsKeptWithAllThatWasRemovedWithIt) {
    std::string theirs = texts.base;
    const std::size_t begin = theirs.find("--- !o!1 &10"), end = theirs.find("--- !o!1 &20");
    theirs.erase(begin, end - begin).replace(theirs.find("\n  - {fileID: 11}"), 17, " []");
    std::string ours = texts.base;
    ours.replace(ours.find("m_Range: 1"), 10, "m_Range: 2");
    const auto removed = SessionOf({texts.base, ours, theirs});
    ASSERT_EQ(removed->Open().size(), 1);
    const auto all = [](const OpenConflict&) { return true; };
    removed->TakeAll(Side::Ours, all);
    EXPECT_EQ(removed->Result(), ours);
    removed->Undo();
    removed->Decide({{"10", Side::Base}});
    EXPECT_EQ(removed->Result(), texts.base);
    removed->Undo();
    removed->TakeAll(Side::Theirs, all);
    EXPECT_EQ(removed->Result(), theirs);
}

TEST_F(SettleSessionTest, DecisionIsAPathAndASide) {
    EXPECT_EQ(ParseWanted("a=b=ours").what, "a=b");
    EXPECT_EQ(ParseWanted("a=theirs").side, Side::Theirs);
    for (const char* wrong : {"", "=", "=ours", "a", "a=", "a=OURS", "a=ours ", "ours", "a=left"})
        EXPECT_THROW(ParseWanted(wrong), Failure) << wrong;
}

TEST_F(SettleSessionTest, LastOfSeveralDecisionsOfOneCallCounts) {
    const std::vector<Wanted> wanted = {{"*.GameObject.m_Layer", Side::Theirs},
                                        {"Harbour.m_Layer", Side::Base},
                                        {"10.GameObject.m_Layer", Side::Ours}};
    DecideWanted(sessions, wanted);
    EXPECT_EQ(session().Open().size(), 1);
    EXPECT_NE(session().Result().find("m_Layer: 5\n  m_Name: Lamp"), std::string::npos);
    EXPECT_NE(session().Result().find("m_Layer: 2\n  m_Name: Harbour"), std::string::npos);
    EXPECT_TRUE(session().Undo() && !session().Undo());
}

TEST_F(SettleSessionTest, FileOfDecisionsThatIsNoneIsTold) {
    const program::WorkingDirectory folder;
    const auto told = [&](const std::string& text) {
        folder.Write("decisions", text);
        return failures::ErrorOf<Failure>(
            [&] { DecideByFile(sessions, (folder.Path() / "decisions").string()); });
    };
    EXPECT_NE(told("").find("has no decision below"), std::string::npos);
    EXPECT_NE(told("Conflict handling:\n").find("has no decision below"), std::string::npos);
    EXPECT_NE(told("Conflict handling:\nMiddle 10\n").find("can't be made out"), std::string::npos);
    EXPECT_NE(told("Conflict handling:\nLeft 10.GameObject.m_None\n").find("matches nothing"),
              std::string::npos);
    EXPECT_TRUE(session().Decisions().empty());
    EXPECT_EQ(told("Conflict handling:\nLeft 10.GameObject.m_Range\nRight 10.GameObject.m_Range\n"), "none");
    EXPECT_NE(session().Result().find("m_Range: 3"), std::string::npos); // the first counts there
    sessions.push_back(SessionOf(texts));
    EXPECT_NE(told("Conflict handling:\nLeft 10\n").find("is for one scene, and there are 2"),
              std::string::npos);
}

TEST_F(SettleSessionTest, ProposalsAreTakenWhereTheyAreAndNowhereElse) {
    EXPECT_THROW(TakeProposed(sessions, ""), Failure);
    const program::WorkingDirectory folder;
    EarlierDecisions earlier({SystemKind::Git, "", folder.Path()});
    session().Propose(earlier);
    session().Decide({{"10.GameObject.m_Range", Side::Theirs}});
    EXPECT_EQ(session().TellDecided(earlier), 1);
    sessions[0] = SessionOf({texts.base, texts.theirs, texts.ours}); // the sides swapped
    session().Propose(earlier);
    EXPECT_EQ(session().CountProposed(), 1);
    EXPECT_THROW(TakeProposed(sessions, "Harbour/Nothing"), Failure);
    EXPECT_EQ(TakeProposed(sessions, "Harbour"), 1);
    EXPECT_NE(session().Result().find("m_Range: 3"), std::string::npos);
    EXPECT_EQ(session().CountProposed(), 0);
    EXPECT_THROW(TakeProposed(sessions, ""), Failure);
}

TEST_F(SettleSessionTest, NameOfSeveralObjectsIsToldWithTheirNumbers) {
    const auto scene = [](int layer) {
        const std::string fields = "GameObject:\n  m_Layer: " + std::to_string(layer) + "\n  m_Name: Crate\n";
        return kHeader + "--- !o!1 &1\n" + fields + "--- !o!1 &2\n" + fields;
    };
    sessions[0] = SessionOf({scene(1), scene(2), scene(3)});
    const std::string told = failures::ErrorOf<Failure>([&] { TakeSide(sessions, Side::Ours, "Crate"); });
    EXPECT_NE(told.find("\n  Crate (1)\n  Crate (2)\n"), std::string::npos) << told;
    EXPECT_THROW(Set("Crate.m_Layer=ours"), Failure);
    EXPECT_EQ(TakeSide(sessions, Side::Ours, "Crate (2)") + TakeSide(sessions, Side::Ours, "1"), 2);
}

TEST_F(SettleSessionTest, CountTellsWhatIsKnown) {
    OpenMerge merge = MergeOf(texts, "a\n.ovrin");
    merge.conflicts = 3;
    EXPECT_EQ(TellCount(SceneCount::Of(merge, {{}, 1})),
              "a\\n.ovrin: 1 open conflict, 2 settled (merge, ours is main, theirs is topic)");
    merge.occasion = {};
    merge.isBothAdded = true;
    EXPECT_EQ(TellCount(SceneCount::Of(merge, {{}, 5})), // decisions led to more
              "a\\n.ovrin: 5 open conflicts, both sides added the scene");
    EXPECT_EQ(ToJson(SceneCount::Of(merge, {{}, 5})).dump(),
              R"({"action":null,"base":null,"bothAdded":true,"open":5,"ours":null,"path":"a\n.ovrin",)"
              R"("problem":null,"settled":0,"theirs":null})");
    EXPECT_EQ(TellCount({.path = "a", .problem = "gone"}), "a: gone");
}

} // namespace
