#include "Settle/SettleDesk.h"

#include "OpenScenes.h"
#include "Words/Failure.h"

#include <algorithm>
#include <gtest/gtest.h>

namespace {

using namespace open_scenes;

/// What stands below Harbour, of Transform 21: a GameObject with a Transform, and a script that has a target.
std::string Entity(int id, const std::string& name, int father, int target = 0, int range = 1,
                   int order = 0) {
    const std::string own = std::to_string(id), transform = std::to_string(id + 1),
                      script = std::to_string(id + 2);
    return "--- !o!1 &" + own + "\nGameObject:\n  m_Component:\n  - component: {fileID: " + transform +
           "}\n  - component: {fileID: " + script + "}\n  m_Name: " + name + "\n--- !o!4 &" + transform +
           "\nTransform:\n  m_GameObject: {fileID: " + own +
           "}\n  m_Children: []\n  m_Father: {fileID: " + std::to_string(father) +
           "}\n  m_Order: " + std::to_string(order) + "\n--- !o!114 &" + script +
           "\nMonoBehaviour:\n  m_GameObject: {fileID: " + own +
           "}\n  m_Target: {fileID: " + std::to_string(target) + "}\n  m_Range: " + std::to_string(range) +
           "\n";
}

std::string Harbour(const std::string& children) {
    return "--- !o!1 &20\nGameObject:\n  m_Component:\n  - component: {fileID: 21}\n  m_Name: Harbour\n"
           "--- !o!4 &21\nTransform:\n  m_GameObject: {fileID: 20}\n  m_Children:" +
           children + "\n  m_Father: {fileID: 0}\n";
}

std::string Child(int id) {
    return "\n  - {fileID: " + std::to_string(id + 1) + "}";
}

struct SettleDeskTest : UnmergedFolder {
    void Merge(const ThreeTexts& texts, const std::string& name = "a.ovrin") const { Unmerge(name, texts); }
    SettleDesk& Open() {
        remarks.clear();
        desk.reset();
        scenes = std::make_unique<SettleScenes>(remarks);
        scenes->Open(remarks);
        return *(desk = std::make_unique<SettleDesk>(*scenes));
    }
    std::string Result() const { return desk->Scenes()[0]->Result(); }
    std::vector<std::string> Remedies() const {
        std::vector<std::string> texts;
        for (const Remedy& remedy : desk->Problems().at(0).remedies) texts.push_back(remedy.text);
        return texts;
    }

    Remarks remarks;
    std::unique_ptr<SettleScenes> scenes;
    std::unique_ptr<SettleDesk> desk;
};

ThreeTexts Ranges(int base, int ours, int theirs) {
    const auto scene = [](int range) { return kHeader + Entity(10, "Lantern", 0, 0, range); };
    return {scene(base), scene(ours), scene(theirs)};
}

TEST_F(SettleDeskTest, StepsAreTakenUpByTheNextDesk) {
    Merge(Ranges(1, 2, 3));
    Merge(Ranges(1, 2, 3), "b.ovrin");
    EXPECT_EQ(Open().CountOpen(), 2);
    EXPECT_EQ(desk->Take(1, Side::Theirs).settled, 1);
    EXPECT_EQ(Open().CountOpen(), 1);
    EXPECT_EQ(desk->Items()[1].decided, Side::Theirs);
    EXPECT_EQ(desk->TakeAll(Side::Base).settled, 1);
    EXPECT_TRUE(desk->IsSettled());
    EXPECT_TRUE(desk->Undo() && desk->Undo() && !desk->Undo());
    EXPECT_EQ(Open().CountOpen(), 2);
}

TEST_F(SettleDeskTest, WhatWasDecidedIsProposedInAnotherMergeOfTheSame) {
    Merge(Ranges(1, 2, 3));
    Open().Take(0, Side::Theirs);
    desk->Finish(false, remarks);
    Merge(Ranges(1, 3, 2)); // as in a rebase
    EXPECT_EQ(Open().CountProposed(), 1);
    EXPECT_EQ(desk->Items()[0].proposed, Side::Ours);
    EXPECT_EQ(desk->TakeProposed().settled, 1);
    EXPECT_EQ(desk->CountProposed(), 0);
    EXPECT_EQ(Result(), Ranges(3, 0, 0).base);
}

TEST_F(SettleDeskTest, SceneIsSettledInOnePlaceAtATime) {
    Merge(Ranges(1, 2, 3));
    Merge(Ranges(1, 2, 3), "b.ovrin");
    Open();
    SettleScenes others(remarks);
    others.Open(remarks);
    SettleDesk(others).Take(1, Side::Theirs);
    EXPECT_THROW(desk->TakeAll(Side::Ours), Failure);
    EXPECT_EQ(desk->CountOpen(), 2);
    EXPECT_EQ(Open().CountOpen(), 1); // of the step that was refused nothing is left
    EXPECT_EQ(desk->Items()[1].decided, Side::Theirs);
    desk->Take(1, Side::Ours);
    EXPECT_THROW(SettleDesk(others).Undo(), Failure);
    EXPECT_TRUE(others.Sessions()[1]->IsSettled());
}

TEST_F(SettleDeskTest, StepThatOneSceneCannotKeepIsTakenBackInAll) {
    Merge(Ranges(1, 2, 3));
    const auto many = [](int range) {
        std::string scene = kHeader;
        for (int id = 100; id < 130; ++id) scene += Object(id, std::to_string(range), "Crate");
        return scene;
    };
    Merge({many(1), many(2), many(3)}, "b.ovrin");
    Open().Take(0, Side::Theirs);
    desk->Take(1, Side::Theirs);
    desk->Undo();
    {
        const surroundings::FileLimit full(700); // enough for the first scene
        EXPECT_THROW(desk->TakeAll(Side::Ours), Failure);
        EXPECT_EQ(desk->CountOpen(), 30);
    }
    EXPECT_EQ(Open().CountOpen(), 30);
    EXPECT_TRUE(desk->Undo() && !desk->Undo());
}

TEST_F(SettleDeskTest, SceneWhoseMergeIsOverIsNotFinished) {
    Merge(Ranges(1, 2, 3));
    Open().Take(0, Side::Theirs);
    OutputOf({"git", "update-index", "--force-remove", "a.ovrin"}); // the merge is given up
    EXPECT_TRUE(desk->Finish(true, remarks).empty());
    ASSERT_EQ(remarks.size(), 1);
    EXPECT_NE(remarks[0].find("ended or made again"), std::string::npos) << remarks[0];
    EXPECT_EQ(program::ReadFile("a.ovrin"), Ranges(2, 0, 0).base);
    Merge(Ranges(1, 2, 4)); // and made again, of other texts
    EXPECT_TRUE(desk->Finish(true, remarks).empty());
}

TEST_F(SettleDeskTest, DecisionsOfAMergeThatWasMadeAgainAreProposedAndNotMade) {
    Merge(Ranges(1, 2, 3));
    Open().Take(0, Side::Base);
    ThreeTexts again = Ranges(1, 2, 3);
    again.theirs += Entity(30, "Boat", 0);
    Merge(again);
    EXPECT_EQ(Open().CountOpen(), 1);
    EXPECT_EQ(desk->Items()[0].proposed, Side::Base);
    ASSERT_EQ(remarks.size(), 1);
    EXPECT_NE(remarks[0].find("merged again"), std::string::npos) << remarks[0];
}

// Theirs removes the buoy, which a light that ours added has for its target.
TEST_F(SettleDeskTest, ReferenceToWhatTheOtherSideRemovedIsAProblemWithRemedies) {
    const std::string lamp = Entity(40, "Lamp", 0, 0, 1), buoy = Entity(10, "Buoy", 21);
    Merge({kHeader + Harbour(Child(10)) + buoy + lamp,
           kHeader + Harbour(Child(10)) + buoy + Entity(40, "Lamp", 0, 10, 2),
           kHeader + Harbour(" []") + Entity(40, "Lamp", 0, 0, 3)});
    ASSERT_EQ(Open().Problems().size(), 1);
    EXPECT_EQ(desk->Problems()[0].text,
              "Lamp · MonoBehaviour: m_Target refers to Harbour/Buoy, which was removed by theirs");
    EXPECT_EQ(Remedies(), (std::vector<std::string>{"keep Harbour/Buoy, too",
                                                    "take Lamp · MonoBehaviour's m_Target from theirs",
                                                    "take Lamp · MonoBehaviour's m_Target from base"}));
    desk->Mend(desk->Problems()[0], desk->Problems()[0].remedies[0]);
    EXPECT_TRUE(desk->Problems().empty());
    desk->TakeAll(Side::Theirs);
    EXPECT_EQ(Result(), kHeader + Harbour(Child(10)) + buoy + Entity(40, "Lamp", 0, 10, 3));
    desk->Undo();
    desk->Undo();
    EXPECT_EQ(desk->Problems().size(), 1);
}

// Theirs removes the lantern, and ours changes its script: a component is kept without what it belongs to.
TEST_F(SettleDeskTest, ObjectThatIsKeptAloneIsAProblem) {
    const std::string kept = kHeader + Harbour(Child(10)) + Entity(10, "Lantern", 21, 0, 2);
    const ThreeTexts texts = {kHeader + Harbour(Child(10)) + Entity(10, "Lantern", 21), kept,
                              kHeader + Harbour(" []")};
    Merge(texts);
    EXPECT_TRUE(Open().Problems().empty()); // the conflict tells it
    desk->Scenes()[0]->Decide({{"12", Side::Ours}}, SettleSession::Follow::No);
    scenes->Keep(*desk->Scenes()[0]);
    ASSERT_EQ(Open().Problems().size(), 1);
    EXPECT_EQ(desk->Problems()[0].text,
              "Harbour/Lantern · MonoBehaviour stays, and Harbour/Lantern, which it "
              "belongs to, was removed by theirs");
    EXPECT_EQ(Remedies().front(), "keep Harbour/Lantern, too");
    desk->Mend(desk->Problems()[0], desk->Problems()[0].remedies[0]);
    EXPECT_EQ(Result(), kept);
    EXPECT_TRUE(desk->Problems().empty());
    desk->Undo();
    desk->Mend(desk->Problems()[0], desk->Problems()[0].remedies[1]);
    EXPECT_EQ(Result(), texts.theirs);
}

TEST_F(SettleDeskTest, ListFollowsAllThatAreKeptOfItAtOnce) {
    const auto scene = [](int range) {
        return kHeader + Harbour(Child(10) + Child(40)) + Entity(10, "Lantern", 21, 0, range) +
               Entity(40, "Buoy", 21, 0, range);
    };
    Merge({scene(1), scene(2), kHeader + Harbour(" []")});
    EXPECT_EQ(Open().TakeAll(Side::Ours).settled, 2);
    EXPECT_EQ(Result(), scene(2));
    desk->Undo();
    desk->TakeAll(Side::Theirs);
    EXPECT_EQ(Result(), kHeader + Harbour(" []"));
}

/// A car with these of the components Engine, 500, and Wheel, 501, which needs an engine.
std::string Car(const std::vector<int>& classes) {
    std::string list, components;
    for (const int id : classes) {
        list += "\n  - component: {fileID: " + std::to_string(id) + "}";
        components += "--- !o!" + std::to_string(id) + " &" + std::to_string(id) + '\n' +
                      (id == 500 ? "Engine" : "Wheel") + ":\n  m_GameObject: {fileID: 10}\n";
    }
    return kHeader + "--- !o!1 &10\nGameObject:\n  m_Component:" + (list.empty() ? " []" : list) +
           "\n  m_Name: Car\n" + components;
}

// Theirs removes the engine, and ours adds a wheel.
TEST_F(SettleDeskTest, RequirementIsSettledByKeepingOrRemovingBoth) {
    folder.Write("types",
                 kHeader +
                     "--- !o!1 &1\nMergeTypeInfo:\n"
                     "- {id: 500, name: Engine, ismulti: 0, baseid: 2, requires: '', conflicts: ''}\n"
                     "- {id: 501, name: Wheel, ismulti: 0, baseid: 2, requires: f4010000, conflicts: ''}\n");
    Merge({Car({500}), Car({500, 501}), Car({})});
    {
        const surroundings::Variable types("OVRIN_TYPE_INFO", "types");
        Open();
    }
    ASSERT_EQ(desk->CountOpen(), 1) << (remarks.empty() ? "" : remarks[0]);
    EXPECT_EQ(desk->Items()[0].about->kind, ConflictKind::BrokenRequirement);
    EXPECT_EQ(desk->Describe(desk->Items()[0]).choices,
              (std::array<std::string, 3>{"keep Car · Engine", "keep Car · Engine",
                                          "remove Car · Engine and what needs it"}));
    desk->Take(0, Side::Ours);
    EXPECT_EQ(Result(), Car({500, 501}));
    desk->Take(0, Side::Theirs);
    EXPECT_EQ(Result(), Car({}));
    EXPECT_TRUE(desk->IsSettled() && desk->Problems().empty());
    EXPECT_TRUE(desk->Undo() && desk->Undo());
    desk->Scenes()[0]->Decide({{"500", Side::Theirs}}, SettleSession::Follow::No);
    scenes->Keep(*desk->Scenes()[0]);
    ASSERT_EQ(Open().Problems().size(), 1);
    EXPECT_EQ(desk->Problems()[0].text, "Car · Engine was removed by theirs, and Car · Wheel needs it");
    for (const std::size_t remedy : {0, 1}) {
        desk->Mend(desk->Problems()[0], desk->Problems()[0].remedies.at(remedy));
        EXPECT_TRUE(desk->Problems().empty());
        desk->Undo();
    }
}

// The engine looks for loops only where both sides changed a Transform.
TEST_F(SettleDeskTest, LoopThatNoConflictTellsIsAProblem) {
    const auto scene = [](int ofTen, int ofForty, int range) {
        return kHeader + Entity(10, "Boat", ofTen, 0, range) + Entity(40, "Pier", ofForty);
    };
    Merge({scene(0, 0, 1), scene(41, 0, 2), scene(0, 11, 3)});
    ASSERT_EQ(Open().Problems().size(), 2);
    EXPECT_EQ(desk->Problems()[0].text, "Pier stands below Boat, and that below Pier");
    desk->Mend(desk->Problems()[0], desk->Problems()[0].remedies.at(0));
    EXPECT_TRUE(desk->Problems().empty());
}

/// Ours puts the boat below the pier, and theirs the pier below the boat.
ThreeTexts BoatAndPier() {
    return {kHeader + Entity(10, "Boat", 0) + Entity(40, "Pier", 0),
            kHeader + Entity(10, "Boat", 41) + Entity(40, "Pier", 0, 0, 1, 1),
            kHeader + Entity(10, "Boat", 0, 0, 1, 1) + Entity(40, "Pier", 11)};
}

TEST_F(SettleDeskTest, EitherSideOfEitherObjectEndsALoop) {
    Merge(BoatAndPier());
    EXPECT_TRUE(Open().Problems().empty()); // of the lists, before anything is decided
    const auto& items = desk->Items();
    for (std::size_t at = 0; at < items.size(); ++at)
        for (const Side side : {Side::Ours, Side::Theirs}) {
            if (items[at].about->kind != ConflictKind::ParentLoop) continue;
            EXPECT_EQ(desk->Take(at, side).settled, 2) << at << SideName(side);
            EXPECT_EQ(desk->Problems().size(), 0);
            desk->Take(at, side == Side::Ours ? Side::Theirs : Side::Ours);
            EXPECT_FALSE(items[at].isOpen);
            EXPECT_TRUE(desk->Undo() && desk->Undo());
        }
}

TEST_F(SettleDeskTest, ChoicesBetweenParentsAreNamed) {
    Merge(BoatAndPier());
    const SettleDesk& opened = Open();
    const auto loop = std::ranges::find_if(opened.Items(), [](const SettleDesk::Item& item) {
        return item.about->kind == ConflictKind::ParentLoop && item.about->path.front()->Value() == "11";
    });
    ASSERT_NE(loop, opened.Items().end()) << (remarks.empty() ? "" : remarks[0]);
    EXPECT_EQ(opened.Describe(*loop).choices,
              (std::array<std::string, 3>{"at the top", "below Pier", "at the top"}));
}

} // namespace
