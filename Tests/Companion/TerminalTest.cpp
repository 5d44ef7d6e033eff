#include "Settle/Terminal/Prompts.h"
#include "Settle/Terminal/Screen.h"

#include "Conflicts/OpenMerges.h"
#include "Systems/Process.h"

#include <clocale>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <sstream>

namespace {

using namespace ovrin;

const std::string kHeader = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";

std::string Object(int id, const std::string& layer, const std::string& name) {
    return "--- !o!1 &" + std::to_string(id) + "\nGameObject:\n  m_Layer: " + layer + "\n  m_Name: " + name +
           "\n";
}

/// Base, ours and theirs: a layer, and an object that theirs has removed.
const std::array<std::string, 3> kTwo = {kHeader + Object(10, "1", "Lantern") + Object(20, "1", "Buoy"),
                                         kHeader + Object(10, "5", "Lantern") + Object(20, "7", "Buoy"),
                                         kHeader + Object(10, "2", "Lantern")};

/// A person in a repository whose index holds scenes unmerged, as a merge that stopped leaves them.
struct TerminalTest : testing::Test {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }
    TerminalTest() {
        std::setlocale(LC_CTYPE, "C.UTF-8");
        char made[] = "/tmp/ovrin-test-XXXXXX";
        std::filesystem::current_path(mkdtemp(made));
        OutputOf({"git", "init", "-q"});
    }
    ~TerminalTest() override {
        const auto folder = std::filesystem::current_path();
        std::filesystem::current_path("/");
        std::filesystem::remove_all(folder);
        std::setlocale(LC_CTYPE, "C");
    }

    void Add(const std::string& name, const std::array<std::string, 3>& texts) {
        std::string entries;
        for (std::size_t i = 0; i < texts.size(); ++i) {
            if (texts[i].empty()) continue;
            const std::string object = OutputOf({"git", "hash-object", "-w", "--stdin"}, {.input = texts[i]});
            entries += "100644 " + object.substr(0, object.find('\n')) + " " + std::to_string(i + 1) + "\t" +
                       name + "\n";
        }
        OutputOf({"git", "update-index", "--index-info"}, {.input = entries});
        OpenMerge merge;
        merge.path = name;
        merge.occasion = {.action = "merge", .base = "", .ours = "main", .theirs = "topic", .head = ""};
        merge.isBothAdded = texts[0].empty();
        merge.rules = OVRIN_SOURCE_DIR "/Src/Data/mergerules.txt";
        merge.texts = {texts[0], texts[1], texts[2]};
        OpenMerges(*FindRepository()).Add(merge);
    }
    void Begin() {
        scenes.emplace(remarks);
        ASSERT_EQ(scenes->Open(remarks), 0) << remarks[0];
        for (const auto& session : scenes->Sessions())
            if (!std::filesystem::exists(session->Source().path))
                std::ofstream(session->Source().path) << session->Left();
        desk.emplace(*scenes);
        walk.emplace(*desk);
        screen.emplace(*walk, letters);
    }
    std::vector<std::string> Picture(Extent extent = Screen::kLeast) {
        std::vector<std::string> texts;
        for (const StyledLine& line : screen->Draw(extent)) {
            EXPECT_EQ(ColumnsOf(line), extent.columns);
            texts.push_back(TextOf(line).substr(0, TextOf(line).find_last_not_of(' ') + 1));
        }
        EXPECT_EQ(texts.size(), extent.rows);
        return texts;
    }
    /// The picture as one text, after these keys.
    std::string After(const std::string& keys, Extent extent = Screen::kLeast) {
        Picture(extent);
        for (const char key : keys) screen->Press(key == '\n' ? Key::Enter : KeyOf(key));
        std::string text;
        for (const std::string& line : Picture(extent)) text += line + '\n';
        return text;
    }

    Remarks remarks;
    const Letters letters = Letters(true);
    std::optional<SettleScenes> scenes;
    std::optional<SettleDesk> desk;
    std::optional<Walk> walk;
    std::optional<Screen> screen;
};

TEST_F(TerminalTest, ScreenShowsTheListTheValuesAndTheKeys) {
    Add("Pier.ovrin", kTwo);
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
    Add("Pier.ovrin", kTwo);
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
    Add("Pier.ovrin", kTwo);
    Begin();
    EXPECT_NE(After("T").find("Took theirs (topic) for Lantern and what stands under it"), std::string::npos);
    EXPECT_EQ(desk->CountOpen(), 1);
    EXPECT_NE(After("a").find("Which side for all that is open? o ours"), std::string::npos);
    EXPECT_NE(After("n").find("Nothing was decided"), std::string::npos);
    EXPECT_EQ(desk->CountOpen(), 1);
}

TEST_F(TerminalTest, ArrowsAndEnterAreEnough) {
    Add("Pier.ovrin", kTwo);
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
    Add("A.ovrin", kTwo);
    Add("B.ovrin", kTwo);
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
    Add("Pier.ovrin",
        {kTwo[0],
         kHeader + Object(10, "5", "Lantern") + "  m_Target: {fileID: 20}\n" + Object(20, "1", "Buoy"),
         kTwo[2]});
    Begin();
    EXPECT_NE(After("of").find("1 problem is left in what is settled. Finish as it is?"), std::string::npos);
    After("n");
    EXPECT_FALSE(screen->End());
    std::istringstream input("f\nn\nf\ny\n");
    std::ostringstream output;
    EXPECT_EQ(SettleByPrompts(*walk, letters, input, output).finished.size(), 1) << output.str();
}

TEST_F(TerminalTest, OnlyKeysThatMergeAreSteps) {
    Add("Pier.ovrin", kTwo);
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
        Add("Pier.ovrin", kTwo);
        std::ofstream("Pier.ovrin") << "by hand\n";
        Begin();
        EXPECT_NE(After("atf").find("was changed by hand"), std::string::npos);
        After(answer);
        ASSERT_TRUE(screen->End());
        EXPECT_EQ(screen->End()->finished.size(), *answer == 'y' ? 1 : 0);
    }
}

TEST_F(TerminalTest, OnlyFilesThatWereChangedByHandAreAskedAbout) {
    for (const char* name : {"A.ovrin", "Over.ovrin", "Pier.ovrin"}) Add(name, kTwo);
    std::ofstream("Pier.ovrin") << "by hand\n";
    Begin();
    After("at");
    OpenMerges(*FindRepository()).Remove("Over.ovrin");
    const std::string asked = After("f");
    EXPECT_NE(asked.find("Pier.ovrin was changed by hand"), std::string::npos) << asked;
    EXPECT_EQ(asked.find("Over.ovrin stays"), std::string::npos) << asked;
    EXPECT_EQ(screen->Reached().finished, std::vector<std::string>{"A.ovrin"});
    EXPECT_EQ(screen->Reached().refused.size(), 2);
}

TEST_F(TerminalTest, SceneThatBothAddedIsLookedThrough) {
    Add("Pier.ovrin", {"", kHeader + Object(10, "5", "Lantern"), kHeader + Object(20, "7", "Buoy")});
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
    std::array<std::string, 3> texts;
    for (std::size_t side = 0; side < texts.size(); ++side) {
        texts[side] = kHeader + Object(10, "1", "Lantern") + "  m_Note:";
        for (int i = 0; i < 900; ++i)
            texts[side] += " word" + std::to_string(i == 400 ? 1000 + static_cast<int>(side) : i);
        texts[side] += "\n";
    }
    Add("Pier.ovrin", texts);
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
    Add("Pier.ovrin", kTwo);
    Begin();
    EXPECT_NE(After("/bUO\n").find("theirs removed it and ours changed it"), std::string::npos);
    EXPECT_EQ(walk->At(), 1);
    EXPECT_NE(After("/crane\n").find("called like \"crane\""), std::string::npos);
    EXPECT_EQ(walk->At(), 1);
}

TEST_F(TerminalTest, SmallWindowIsToldAndNothingIsLost) {
    Add("Pier.ovrin", kTwo);
    Begin();
    for (const Extent extent : {Extent{1, 1}, Extent{79, 24}, Extent{300, 23}}) After("", extent);
    EXPECT_NE(After("", {79, 24}).find("This window has 79 x 24 characters"), std::string::npos);
    for (std::size_t rows = 24; rows < 60; ++rows) After("vp", {80 + 3 * rows, rows});
    After("q", {20, 3});
    EXPECT_TRUE(screen->End());
}

TEST_F(TerminalTest, ASCIIIsEnough) {
    Add("Pier.ovrin", {kTwo[0], kTwo[1] + "  m_Note: \"\\u706F\"\n", kTwo[2]});
    Begin();
    screen.emplace(*walk, Letters(false));
    for (const char letter : After("?") + After(" n")) EXPECT_LT(static_cast<unsigned char>(letter), 0x80);
}

TEST_F(TerminalTest, PromptsAskTheSameThings) {
    Add("Pier.ovrin", kTwo);
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
    Add("Pier.ovrin", kTwo);
    Begin();
    std::istringstream answers("t\n");
    std::ostringstream told;
    EXPECT_TRUE(SettleByPrompts(*walk, letters, answers, told).finished.empty());
    SettleScenes again(remarks);
    again.Open(remarks);
    EXPECT_EQ(again.Sessions()[0]->Open().size(), 1);
}

} // namespace
