#include "Settle/Terminal/Prompts.h"

#include "TerminalScene.h"

#include <gtest/gtest.h>
#include <sstream>

namespace {

using namespace open_scenes;

struct PromptsTest : TerminalScene {
    /// What is told after these answers.
    std::string Told(const std::string& answers) {
        Begin();
        std::istringstream input(answers);
        std::ostringstream output;
        end = SettleByPrompts(*walk, letters, input, output);
        return output.str();
    }

    TerminalEnd end;
};

TEST_F(PromptsTest, AnswersThatAreNoneDecideNothing) {
    Record("a.ovrin", TwoConflicts());
    for (const auto& [answers, words] : std::map<std::string, const char*>{
             {"tt\n", "\"tt\" is no answer"},
             {"ours\n", "\"ours\" is no answer"},
             {" t\n", "\" t\" is no answer"},
             {"t\r\n", "\"t\\r\" is no answer"},
             {"\x1b[A\n", "\"\\x1b[A\" is no answer"},
             {"\xc3\xb6\n", "\"ö\" is no answer"},
             {std::string("\0\n", 2), "is no answer"},
             {"a\nx\n", "Nothing was decided"},
             {"a\ntt\n", "Nothing was decided"},
             {"a", "2 of 2 open"},
             {"u\n", "There is no step to take back"},
             {"r\n", "No step was taken back"},
             {"9\n", "Nothing is offered under that number"},
             {"/\n", "Write what to search for"},
             {"/crane\n", "called like \"crane\""},
             {"k\n", "\"k\" is no answer"},
             {"f\ny\n", "No scene is settled yet"},
             {"\n\n\n", "Buoy (20)"},
         }) {
        EXPECT_NE(Told(answers).find(words), std::string::npos) << answers << Told(answers);
        EXPECT_EQ(desk->CountOpen(), 2) << answers;
        EXPECT_TRUE(scenes->Sessions()[0]->Decisions().empty()) << answers;
    }
}

TEST_F(PromptsTest, EnterTakesWhatIsProposed) {
    Record("a.ovrin", TwoConflicts());
    Told("b\nt\nf\n");
    Record("a.ovrin", TwoConflicts());
    const std::string told = Told("\n\nf\n");
    EXPECT_NE(told.find("decided before: base, which Enter takes again"), std::string::npos) << told;
    EXPECT_EQ(end.finished.size(), 1);
    EXPECT_EQ(folder.Read("a.ovrin"), kHeader + Object(10, "1", "Lantern"));
}

TEST_F(PromptsTest, WholeValuesAreToldOnRequest) {
    std::string note = "  m_Note: ";
    for (int i = 0; i < 200; ++i) note += "word" + std::to_string(i) + " ";
    const auto scene = [&](const char* last) {
        return kHeader + Object(10, "1", "Lantern") + note + last + "\n";
    };
    Record("a.ovrin", {scene("one"), scene("two"), scene("three")});
    const std::string told = Told("");
    EXPECT_EQ(told.find("word190"), std::string::npos) << told;
    for (const char* words : {"base:", "ours (main):", "theirs (topic):", "word199 three"})
        EXPECT_NE(Told("v\n").find(words), std::string::npos) << words;
}

TEST_F(PromptsTest, SceneThatBothAddedIsLookedThrough) {
    Record("a.ovrin", {"", kHeader + Object(10, "5", "Lantern"), kHeader + Object(20, "7", "Buoy")});
    const std::string told = Told("\nv\no\nt\nf\n");
    for (const char* words : {"Both sides added this scene", "Buoy", "The scene is taken as it is",
                              "There is nothing to decide in this scene"})
        EXPECT_NE(told.find(words), std::string::npos) << words << told;
    EXPECT_EQ(end.finished.size(), 1);
}

TEST_F(PromptsTest, FileThatWasChangedByHandIsReplacedOnlyWhenAgreed) {
    Record("a.ovrin", TwoConflicts());
    folder.Write("a.ovrin", "by hand\n");
    for (const char* answers : {"a\nt\nf\n", "f\nn\n", "f\nY\n", "f\n\n"}) {
        EXPECT_NE(Told(answers).find("was changed by hand"), std::string::npos);
        EXPECT_EQ(end.refused.size(), 1);
        EXPECT_EQ(folder.Read("a.ovrin"), "by hand\n") << answers;
    }
    Told("f\ny\n");
    EXPECT_TRUE(end.refused.empty());
    EXPECT_EQ(folder.Read("a.ovrin"), TwoConflicts().theirs);
}

} // namespace
