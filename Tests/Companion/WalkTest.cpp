#include "Settle/Terminal/Walk.h"

#include "Settle/Terminal/CarryOut.h"
#include "TerminalScene.h"

#include <gtest/gtest.h>

namespace {

using namespace open_scenes;

struct WalkTest : TerminalScene {
    /// Two scenes with two conflicts each, and between them one that both sides added.
    void BeginThree() {
        Record("a.ovrin", TwoConflicts());
        Record("b.ovrin", {"", TwoConflicts().ours, TwoConflicts().ours});
        Record("c.ovrin", TwoConflicts());
        Begin();
    }
    void Press(const std::string& keys) {
        for (const char key : keys) CarryOut(*walk, RequestOf(KeyOf(key)).value(), KeyOf(key));
    }
    bool Says(const std::string& words) const { return walk->Said().find(words) != std::string::npos; }
};

TEST_F(WalkTest, GoesRoundOverWhatIsOpen) {
    BeginThree();
    std::string way;
    for (const char* key : {"n", "n", "n", "n", "n", "p", "p", "k", "k", "j"}) {
        Press(key);
        way += std::to_string(walk->At());
    }
    EXPECT_EQ(way, "1234043212");
    Press("t");
    EXPECT_EQ(walk->At(), 3);
    Press("kkn");
    EXPECT_EQ(walk->At(), 3); // past the settled one
    CarryOut(*walk, Request::Last, {});
    EXPECT_EQ(walk->At(), 4);
    Press("j");
    EXPECT_EQ(walk->At(), 4);
    walk->TakeAll(Side::Theirs);
    CarryOut(*walk, Request::First, {});
    Press("n");
    EXPECT_TRUE(Says("Nothing is open") && walk->At() == 0);
}

TEST_F(WalkTest, FindsNamesOfAnyVersionPropertiesAndScenes) {
    ThreeTexts texts = TwoConflicts();
    texts.theirs = kHeader + Object(10, "2", "Lamp");
    Record("a.ovrin", texts);
    Record("c.ovrin", TwoConflicts());
    Begin();
    std::string found;
    for (const char* text : {"buoy", "C.OVRIN", "M_LAY", "lamp", "lantern"}) {
        walk->Find(text);
        found += std::to_string(walk->At());
        EXPECT_TRUE(Says("Found")) << text;
    }
    EXPECT_EQ(found, "12002");
    walk->Find("\x1b[2J");
    EXPECT_TRUE(Says("called like") && walk->At() == 2);
}

TEST_F(WalkTest, UndoGoesToWhatIsOpenAgainWhereverThatIs) {
    BeginThree();
    Press("ttttt");
    EXPECT_EQ(walk->CountOpen(), 0);
    EXPECT_TRUE(Says("All is settled"));
    for (const std::size_t open : {4, 3, 2, 1, 0}) {
        walk->GoTo(0);
        Press("u");
        EXPECT_EQ(walk->At(), open);
    }
    Press("u");
    EXPECT_TRUE(Says("no step to take back"));
    Press("rrrrr");
    EXPECT_EQ(walk->CountOpen(), 0);
    Press("r");
    EXPECT_TRUE(Says("No step was taken back"));
}

TEST_F(WalkTest, WhatThereIsNotIsToldAndMakesNoStep) {
    Record("a.ovrin", TwoConflicts());
    Begin();
    Press("g");
    EXPECT_TRUE(Says("Nothing is proposed"));
    Press("9");
    EXPECT_TRUE(Says("Nothing is offered under that number"));
    walk->TakeAll(Side::Theirs);
    walk->TakeAll(Side::Ours);
    EXPECT_TRUE(Says("Nothing is open any more"));
    walk->TakeWhole(Side::Ours);
    EXPECT_TRUE(Says("Nothing is open about"));
    EXPECT_EQ(scenes->Sessions()[0]->Decisions().size(), 2);
}

TEST_F(WalkTest, StepThatCannotBeKeptIsToldAndTakenBack) {
    Record("a.ovrin", TwoConflicts());
    Unmerge("b.ovrin", TwoConflicts()); // of which nothing is written down yet
    Begin();
    Press("t");
    const auto& sessions = scenes->Sessions();
    const std::string before = sessions[0]->Result() + sessions[1]->Result();
    for (const char* step : {"t", "nt", "nT", "u"}) {
        {
            const surroundings::FileLimit full(0);
            Press(step);
        }
        EXPECT_TRUE(Says("stays as it was")) << step << ": " << walk->Said();
        EXPECT_EQ(walk->CountOpen(), 3) << step;
        EXPECT_EQ(sessions[0]->Result() + sessions[1]->Result(), before) << step;
    }
    walk->TakeAll(Side::Theirs); // once there is room
    EXPECT_EQ(walk->CountOpen(), 0) << walk->Said();
    Begin();
    EXPECT_EQ(walk->CountOpen(), 0);
    Press("uu");
    EXPECT_EQ(walk->CountOpen(), 4);
}

TEST_F(WalkTest, FinishThatFailsIsToldAndTheNextOneCompletesIt) {
    Record("a.ovrin", TwoConflicts());
    Begin();
    walk->TakeAll(Side::Theirs);
    {
        const surroundings::FileLimit full(0);
        EXPECT_FALSE(walk->Finish(false));
    }
    EXPECT_TRUE(Says("can't be written")) << walk->Said();
    EXPECT_EQ(folder.Read("a.ovrin"), TwoConflicts().ours);
    EXPECT_EQ(walk->Finish(false)->paths.size(), 1);
    EXPECT_EQ(folder.Read("a.ovrin"), TwoConflicts().theirs);
}

} // namespace
