#include "Settle/Terminal/Screen.h"

#include "Settle/Terminal/Prompts.h"
#include "TerminalScene.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <random>
#include <sstream>

namespace {

using namespace open_scenes;

const ThreeTexts kTwo = TwoConflicts();

struct TerminalTest : TerminalScene {};

TEST_F(TerminalTest, ScreenShowsTheListTheValuesAndTheKeys) {
    Record("Pier.ovrin", kTwo);
    Begin();
    const std::vector<std::string> expected = {
        " 2 of 2 open · Pier.ovrin                  merge: ours is main, theirs is topic",
        "Lantern                        │ Lantern (10)",
        " • m_Layer                     │ m_Layer: both changed it",
        "Buoy                           │",
        " • whole object                │ b base",
        "                               │   1",
        "                               │",
        "                               │ o ours  main",
        "                               │   5",
        "                               │",
        "                               │ t theirs  topic",
        "                               │   2",
    };
    std::vector<std::string> picture = Picture();
    picture.resize(expected.size());
    EXPECT_EQ(picture, expected);
}

TEST_F(TerminalTest, DecisionGoesOnToTheNextAndUndoComesBack) {
    Record("Pier.ovrin", kTwo);
    Begin();
    std::string text = After("o");
    EXPECT_NE(text.find("   m_Layer                ours │ theirs removed it and ours changed it"),
              std::string::npos)
        << text;
    EXPECT_NE(text.find("1 of 2 open"), std::string::npos);
    EXPECT_NE(text.find("  changed m_Layer"), std::string::npos) << text;
    text = After("u");
    EXPECT_NE(text.find("m_Layer: both changed it"), std::string::npos) << text;
    EXPECT_EQ(desk->CountOpen(), 2);
    After("rat");
    EXPECT_TRUE(desk->IsSettled());
    EXPECT_NE(After("").find("f finishes"), std::string::npos);
}

TEST_F(TerminalTest, CapitalsAreForOneObjectAndAllIsAskedFor) {
    Record("Pier.ovrin", kTwo);
    Begin();
    EXPECT_NE(After("T").find("Took theirs (topic) for Lantern and what stands under it"), std::string::npos);
    EXPECT_EQ(desk->CountOpen(), 1);
    EXPECT_NE(After("a").find("Which side for all that is open? o ours"), std::string::npos);
    EXPECT_NE(After("n").find("Nothing was decided"), std::string::npos);
    EXPECT_EQ(desk->CountOpen(), 1);
}

TEST_F(TerminalTest, ArrowsAndEnterAreEnough) {
    Record("Pier.ovrin", kTwo);
    Begin();
    EXPECT_NE(After("\n").find("Choose a side"), std::string::npos);
    screen->Press(Key::Right);
    screen->Press(Key::Right);
    EXPECT_NE(After("").find("Enter takes"), std::string::npos);
    screen->Press(Key::Enter);
    screen->Press(Key::Left);
    screen->Press(Key::Enter);
    const auto& items = desk->Items();
    EXPECT_EQ(items[0].decided, Side::Ours);
    EXPECT_EQ(items[1].decided, Side::Theirs);
    screen->Press(Key::Enter);
    ASSERT_TRUE(screen->End());
    EXPECT_EQ(screen->End()->finished, std::vector<std::string>{"Pier.ovrin"});
}

TEST_F(TerminalTest, SeveralScenesAreOneListAndFinishedApartOnlyWhenAgreed) {
    Record("A.ovrin", kTwo);
    Record("B.ovrin", kTwo);
    Begin();
    EXPECT_NE(After("f").find("No scene is settled yet"), std::string::npos);
    EXPECT_NE(After("otf").find("1 scene is settled, 1 scene is not"), std::string::npos);
    After("n");
    EXPECT_FALSE(screen->End());
    After("fy");
    ASSERT_TRUE(screen->End());
    EXPECT_EQ(screen->End()->finished, std::vector<std::string>{"A.ovrin"});
}

// Ours refers to the buoy, which theirs has removed.
TEST_F(TerminalTest, ProblemsThatAreLeftAreFinishedOnlyWhenAgreed) {
    Record("Pier.ovrin",
           {kTwo.base,
            kHeader + Object(10, "5", "Lantern") + "  m_Target: {fileID: 20}\n" + Object(20, "1", "Buoy"),
            kTwo.theirs});
    Begin();
    EXPECT_NE(After("of").find("1 problem is left in what is settled. Finish as it is?"), std::string::npos);
    After("n");
    EXPECT_FALSE(screen->End());
    std::istringstream input("f\nn\nf\ny\n");
    std::ostringstream output;
    EXPECT_EQ(SettleByPrompts(*walk, letters, input, output).finished.size(), 1) << output.str();
}

TEST_F(TerminalTest, OnlyKeysThatMergeAreSteps) {
    Record("Pier.ovrin", kTwo);
    Begin();
    for (const char key : std::string("otbOTBugrf1")) EXPECT_TRUE(screen->IsStep(KeyOf(key))) << key;
    for (const char key : std::string("np?/aq")) EXPECT_FALSE(screen->IsStep(KeyOf(key))) << key;
    screen->Press(KeyOf('a'));
    EXPECT_TRUE(screen->IsStep(KeyOf('t')) && !screen->IsStep(KeyOf('n')));
    EXPECT_NE(TextOf(screen->DrawWorking(Screen::kLeast)[Screen::kLeast.rows - 3]).find("Working"),
              std::string::npos);
}

TEST_F(TerminalTest, FileThatWasChangedByHandIsReplacedOnlyWhenAgreed) {
    for (const char* answer : {"n", "y"}) {
        Record("Pier.ovrin", kTwo);
        folder.Write("Pier.ovrin", "by hand\n");
        Begin();
        EXPECT_NE(After("atf").find("was changed by hand"), std::string::npos);
        After(answer);
        ASSERT_TRUE(screen->End());
        EXPECT_EQ(screen->End()->finished.size(), *answer == 'y' ? 1 : 0);
    }
}

TEST_F(TerminalTest, OnlyFilesThatWereChangedByHandAreAskedAbout) {
    for (const char* name : {"A.ovrin", "Over.ovrin", "Pier.ovrin"}) Record(name, kTwo);
    folder.Write("Pier.ovrin", "by hand\n");
    Begin();
    After("at");
    OpenMerges(Found()).Remove("Over.ovrin");
    const std::string asked = After("f");
    EXPECT_NE(asked.find("Pier.ovrin was changed by hand"), std::string::npos) << asked;
    EXPECT_EQ(asked.find("Over.ovrin stays"), std::string::npos) << asked;
    EXPECT_EQ(screen->Reached().finished, std::vector<std::string>{"A.ovrin"});
    EXPECT_EQ(screen->Reached().refused.size(), 2);
}

TEST_F(TerminalTest, SceneThatBothAddedIsLookedThrough) {
    Record("Pier.ovrin", {"", kHeader + Object(10, "5", "Lantern"), kHeader + Object(20, "7", "Buoy")});
    Begin();
    const std::string text = After("");
    EXPECT_NE(text.find("1 of 1 open"), std::string::npos) << text;
    EXPECT_NE(text.find("Both sides added this scene"), std::string::npos);
    EXPECT_NE(text.find("  Buoy"), std::string::npos);
    After("\n\n");
    ASSERT_TRUE(screen->End());
    EXPECT_EQ(screen->End()->finished.size(), 1);
}

TEST_F(TerminalTest, LongValuesBeginAtTheirDifferenceAndScroll) {
    const auto scene = [](int different) {
        std::string text = kHeader + Object(10, "1", "Lantern") + "  m_Note:";
        for (int i = 0; i < 900; ++i) text += " word" + std::to_string(i == 400 ? different : i);
        return text + "\n";
    };
    Record("Pier.ovrin", {scene(1000), scene(1001), scene(1002)});
    Begin();
    for (const Extent extent : {Screen::kLeast, Extent{160, 50}}) {
        const std::string text = After("", extent);
        for (const char* word : {"word399", "word1000", "word1001", "word1002"})
            EXPECT_NE(text.find(word), std::string::npos) << text;
        EXPECT_EQ(After(std::string(90, 'v'), extent).find("word399"), std::string::npos);
        EXPECT_NE(After(std::string(90, 'V'), extent).find("word0 "), std::string::npos);
        screen.emplace(*walk, letters);
    }
}

TEST_F(TerminalTest, SearchFindsAPartOfAName) {
    Record("Pier.ovrin", kTwo);
    Begin();
    EXPECT_NE(After("/bUO\n").find("theirs removed it and ours changed it"), std::string::npos);
    EXPECT_EQ(walk->At(), 1);
    EXPECT_NE(After("/crane\n").find("called like \"crane\""), std::string::npos);
    EXPECT_EQ(walk->At(), 1);
}

TEST_F(TerminalTest, SmallWindowIsToldAndNothingIsLost) {
    Record("Pier.ovrin", kTwo);
    Begin();
    for (const Extent extent : {Extent{1, 1}, Extent{79, 24}, Extent{300, 23}}) After("", extent);
    EXPECT_NE(After("", {79, 24}).find("This window has 79 x 24 characters"), std::string::npos);
    for (std::size_t rows = 24; rows < 60; ++rows) After("vp", {80 + 3 * rows, rows});
    After("q", {20, 3});
    EXPECT_TRUE(screen->End());
}

TEST_F(TerminalTest, ASCIIIsEnough) {
    Record("Pier.ovrin", {kTwo.base, kTwo.ours + "  m_Note: \"\\u706F\"\n", kTwo.theirs});
    Begin();
    screen.emplace(*walk, Letters(false));
    for (const char letter : After("?") + After(" n")) EXPECT_LT(static_cast<unsigned char>(letter), 0x80);
}

TEST_F(TerminalTest, PromptsAskTheSameThings) {
    Record("Pier.ovrin", kTwo);
    Begin();
    std::istringstream answers("x\nf\no\na\nt\nf\n");
    std::ostringstream told;
    EXPECT_EQ(SettleByPrompts(*walk, letters, answers, told).finished.size(), 1);
    for (const char* words : {"2 of 2 open · Pier.ovrin\nLantern (10)\n  m_Layer: both changed it\n    base  "
                              "  1\n    ours    5    main\n",
                              "\"x\" is no answer", "No scene is settled yet",
                              "Which side for all that is open? o ours", "0 of 2 open"})
        EXPECT_NE(told.str().find(words), std::string::npos) << words << "\n" << told.str();
}

TEST_F(TerminalTest, EndOfTheAnswersLeavesAndKeepsTheDecisions) {
    Record("Pier.ovrin", kTwo);
    Begin();
    std::istringstream answers("t\n");
    std::ostringstream told;
    EXPECT_TRUE(SettleByPrompts(*walk, letters, answers, told).finished.empty());
    SettleScenes again(remarks);
    again.Open(remarks);
    EXPECT_EQ(again.Sessions()[0]->Open().size(), 1);
}

TEST_F(TerminalTest, SearchTakesCharactersAndGivesThemBack) {
    Record("Pier.ovrin", kTwo);
    Begin();
    After("/");
    for (const std::uint32_t point : {0x62, 0xE4, 0x706F, 0x1F6A2, 0x9B})
        screen->Press(static_cast<Key>(point));
    EXPECT_NE(After("").find("Search: bä灯\U0001F6A2\\u009b_"), std::string::npos) << After("");
    for (const char* left : {"bä灯\U0001F6A2_", "bä灯_", "bä_", "b_", " _", " _"}) {
        screen->Press(Key::Erase);
        EXPECT_NE(After("").find(left), std::string::npos) << left;
    }
    EXPECT_NE(After("\n").find("Nothing was searched for before"), std::string::npos);
    After("/buoy");
    screen->Press(Key::Escape);
    EXPECT_EQ(walk->At(), 0);
}

TEST_F(TerminalTest, QuestionsStayUntilTheyAreAnsweredAndDecideNothingByOtherKeys) {
    Record("Pier.ovrin", kTwo);
    Record("Quay.ovrin", kTwo);
    Begin();
    for (const Key key : {Key::Enter, Key::Escape, Key::Unknown, KeyOf('O'), KeyOf('a'), KeyOf('y')}) {
        EXPECT_NE(After("a").find("Which side for all that is open"), std::string::npos);
        screen->Press(Key::Redraw);
        EXPECT_NE(After("").find("Which side for all that is open"), std::string::npos);
        screen->Press(key);
        EXPECT_NE(After("").find("Nothing was decided"), std::string::npos);
    }
    EXPECT_EQ(desk->CountOpen(), 4);
    After("ot");
    for (const Key key : {Key::Enter, Key::Escape, KeyOf('Y'), KeyOf('f')}) {
        EXPECT_NE(After("f").find("1 scene is settled, 1 scene is not"), std::string::npos);
        screen->Press(key);
        EXPECT_NE(After("").find("Nothing was finished"), std::string::npos);
    }
    EXPECT_EQ(Unmerged(), "Pier.ovrin\nQuay.ovrin");
}

TEST_F(TerminalTest, HelpScrollsWithinItsLinesAndGoesBack) {
    Record("Pier.ovrin", kTwo);
    Begin();
    const std::string first = After("?");
    EXPECT_NE(first.find("any other key goes back"), std::string::npos) << first;
    const std::string last = After(std::string(90, 'j'));
    EXPECT_NE(last.find("go back in them"), std::string::npos) << last;
    EXPECT_EQ(After(std::string(90, 'k')), first);
    EXPECT_EQ(After("j", {200, 60}).find("any other key"), std::string::npos); // all of it is in sight
    EXPECT_NE(After("t").find("2 of 2 open"), std::string::npos);              // which takes nothing
}

TEST_F(TerminalTest, PlaceIsInSightWhateverTheSizeOfTheList) {
    ThreeTexts texts = {kHeader, kHeader, kHeader};
    for (int id = 100; id < 160; ++id) {
        texts.base += Object(id, "1", "B" + std::to_string(id));
        texts.ours += Object(id, "2", "B" + std::to_string(id));
        texts.theirs += Object(id, "3", "B" + std::to_string(id));
    }
    Record("Pier.ovrin", texts);
    Begin();
    std::mt19937 random(1);
    std::size_t top = 0;
    for (int round = 0; round < 300; ++round) {
        walk->GoTo(random() % walk->Stops().size());
        const std::size_t rows = 2 + random() % 30;
        const auto lines = ConflictListLines(*walk, letters, {40, rows}, top);
        ASSERT_EQ(lines.size(), rows);
        const auto isSelected = [](const StyledLine& line) { return line.front().style == Style::Selected; };
        const auto selected = std::ranges::find_if(lines, isSelected);
        ASSERT_TRUE(selected != lines.end() && selected != lines.begin());
        EXPECT_EQ(std::ranges::count_if(lines, isSelected), 1);
        // The object's name stands above.
        EXPECT_NE(TextOf(*std::prev(selected)).find(walk->ObjectOf(walk->Here())), std::string::npos);
    }
}

TEST_F(TerminalTest, NamesAndValuesOfOthersCannotSpeakToTheTerminal) {
    const auto scene = [](const char* layer) {
        return kHeader + Object(10, layer, "\"\\x1B]0;gone\\x07\\u202E\"") + "  m_Note: \"\\x1B[2J\\n\\x9b" +
               layer + "\"\n";
    };
    OpenMerge merge = MergeOf({scene("1"), scene("2"), scene("3")}, "\x1b[2J.ovrin");
    merge.occasion.ours = "\x1b]52;c;x\x07";
    Unmerge(merge.path, merge.texts);
    OpenMerges(Found()).Add(merge);
    Begin();
    std::string seen = After("") + After("?") + After("nw") + After("x/[2J\n") + After("f") + After("of");
    std::istringstream input("v\nn\nv\n?\na\nx\na\nt\nq\n");
    std::ostringstream output;
    SettleByPrompts(*walk, letters, input, output);
    seen += output.str();
    for (const char letter : seen) EXPECT_TRUE(letter == '\n' || static_cast<unsigned char>(letter) >= ' ');
    for (const char* harmful : {"\u202E", "\u009b"}) EXPECT_EQ(seen.find(harmful), std::string::npos);
}

TEST_F(TerminalTest, WhateverIsPressedIsKeptAndFitsAnyWindow) {
    const auto holder = [](int target) {
        return "--- !o!114 &90\nMonoBehaviour:\n  m_Target: {fileID: " + std::to_string(target) + "}\n";
    };
    ThreeTexts texts = kTwo;
    texts.base += holder(0);
    texts.ours += holder(20); // which theirs has removed
    texts.theirs += holder(0);
    std::string wide = kTwo.theirs;
    wide.replace(wide.find("Lantern"), 7, "灯台灯台灯台灯台");
    const std::vector<Key> keys = [] {
        std::vector<Key> all = {Key::Up,    Key::Down,   Key::Left,  Key::Right,  Key::Home,     Key::End,
                                Key::Enter, Key::Escape, Key::Erase, Key::PageUp, Key::PageDown, Key::Redraw};
        for (const char key : std::string("npotbwOTBgurrjkvV12/?uuotb")) all.push_back(KeyOf(key));
        return all;
    }();
    for (unsigned seed = 0; seed < 12; ++seed) {
        Record("a.ovrin", texts);
        Record("b.ovrin", {"", kTwo.ours, kTwo.theirs});
        Unmerge("c.ovrin", {kTwo.base, kTwo.ours, wide});
        Begin();
        std::mt19937 random(seed);
        for (int pressed = 0; pressed < 60 && !screen->End(); ++pressed) {
            screen->Press(keys[random() % keys.size()]);
            Picture({80 + random() % 120, 24 + random() % 40});
        }
        if (screen->End()) continue;
        SettleScenes again(remarks);
        again.Open(remarks);
        for (std::size_t at = 0; at < 3; ++at)
            EXPECT_EQ(again.Sessions()[at]->Decisions(), scenes->Sessions()[at]->Decisions()) << seed;
    }
}

} // namespace
