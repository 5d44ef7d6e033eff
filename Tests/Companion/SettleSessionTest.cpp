#include "Settle/SettleSession.h"

#include "Settle/Steps.h"
#include "Settle/Wanted.h"
#include "Words/Failure.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin;

const std::string kHeader = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";

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

std::unique_ptr<SettleSession> SessionOf(const ThreeTexts& texts, const Progress& progress = {}) {
    OpenMerge merge;
    merge.path = "a.ovrin";
    merge.rules = OVRIN_SOURCE_DIR "/Src/Data/mergerules.txt";
    merge.texts = texts;
    return std::make_unique<SettleSession>(merge, progress);
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

} // namespace
