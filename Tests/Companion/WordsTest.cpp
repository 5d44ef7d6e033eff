#include "Commands/PathArguments.h"
#include "Commands/Suggestion.h"
#include "Doctor/TemporaryFiles.h"
#include "ErrorOf.h"
#include "Scenes/SceneRules.h"
#include "Settle/SceneWords.h"
#include "Settle/Wanted.h"
#include "Support/GitFolder.h"
#include "Systems/Pager.h"
#include "Words/Failure.h"
#include "Words/ProgressCount.h"
#include "Words/ProgressLine.h"

#include "Descriptor.h"
#include "FileUtils.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <fcntl.h>
#include <thread>

namespace {

using namespace ovrin;
using failures::ErrorOf;
using surroundings::Variable;
using Words = std::vector<std::string>;

const Words kKnown = {"merge", "status", "settle", "check", "preview", "--json", "--take"};

TEST(Nearest, IsAWordWithOneLetterWrong) {
    for (const std::string& word : kKnown) {
        EXPECT_EQ(Nearest(word, kKnown), word);
        for (std::size_t at = 0; at < word.size(); ++at) {
            std::string changed = word, without = word, with = word, swapped = word;
            changed[at] = 'Q';
            without.erase(at, 1);
            with.insert(at, "Q");
            std::swap(swapped[at], swapped[(at + 1) % word.size()]);
            for (const std::string& wrong : {changed, without, with})
                EXPECT_EQ(Nearest(wrong, kKnown), word) << wrong;
            EXPECT_TRUE(at + 1 == word.size() || Nearest(swapped, kKnown) == word) << swapped;
        }
    }
}

TEST(Nearest, IsNoneOfWordsFarAway) {
    for (const char* word : {"", "xyz", "checkout-index", "-"}) EXPECT_EQ(Nearest(word, kKnown), "") << word;
    EXPECT_EQ(Nearest("check", {}), "");
}

TEST(PathArguments, StandBehindTheMarkOfCommandsThatTakeThem) {
    CLI::App program;
    std::vector<std::string> paths;
    program.add_subcommand("diff")->add_option(kPathOption, paths);
    program.add_subcommand("check");
    const std::pair<Words, Words> cases[] = {
        {{}, {}},
        {{"--"}, {"--"}},
        {{"diff", "a"}, {"diff", "a"}},
        {{"diff", "a", "--", "b", "-c", "--"}, {"diff", "a", "--path=b", "--path=-c", "--path=--"}},
        {{"diff", "--"}, {"diff"}},
        {{"check", "--", "b"}, {"check", "--", "b"}},
        {{"unknown", "--", "b"}, {"unknown", "--", "b"}},
    };
    for (const auto& [given, expected] : cases) EXPECT_EQ(WithPathOptions(program, given), expected);
}

TEST(Wanted, IsCutAtItsLastSign) {
    for (const auto& [text, what, side] :
         {std::tuple{"10.Light.x=ours", "10.Light.x", Side::Ours},
          {"a=b=theirs", "a=b", Side::Theirs},
          {"Harbour/Pier · Light.x=base", "Harbour/Pier · Light.x", Side::Base}}) {
        EXPECT_EQ(ParseWanted(text).what, what);
        EXPECT_EQ(ParseWanted(text).side, side);
    }
    for (const char* text : {"", "a", "=ours", "a=", "a=left", "a=ours ", "a=Ours"})
        EXPECT_THROW(ParseWanted(text), Failure) << text;
    EXPECT_EQ(ErrorOf<Failure>([] { ParseWanted("\x1b"); }),
              "\"\\x1b\" is no decision: write PATH=ours, PATH=theirs or PATH=base");
}

TEST(SceneRules, FilesThatCantBeReadAreNamed) {
    const program::WorkingDirectory folder;
    folder.Write("rules", "no rule\n");
    const std::string rules = (folder.Path() / "rules").string(), none = (folder.Path() / "none").string();
    for (const std::string& file : {rules, none})
        EXPECT_NE(ErrorOf<Failure>([&] {
                      ReadSceneRules({.rules = file, .typeInfo = kDefaultTypeInfoFile});
                  }).find(file),
                  std::string::npos);
    EXPECT_NE(ErrorOf<Failure>([&] { ReadTypeInfo(none); }).find(none), std::string::npos);
    const Variable named("OVRIN_RULES", rules), empty("OVRIN_TYPE_INFO", "");
    EXPECT_EQ(FormatFiles::OfEnvironment().rules, rules);
    EXPECT_EQ(FormatFiles::OfEnvironment().typeInfo, kDefaultTypeInfoFile);
}

struct NextStepsTest : GitFolder {};

TEST_F(NextStepsTest, LeadFromTheLastUnmergedFileToTheEnd) {
    const std::string base = Commit({{"a\n", "1"}, {"b", "1"}});
    CommitOn("topic", base, {{"a\n", "2"}, {"b", "2"}});
    Git({"checkout", "-q", "main"});
    Commit({{"a\n", "3"}, {"b", "3"}});
    EXPECT_EQ(NextSteps(Found(), "merge"), Words{});
    EXPECT_EQ(RunProcess({"git", "merge", "topic"}).status, 1);
    EXPECT_EQ(NextSteps(Found(), "merge"), (Words{"Still unmerged: a\\n and 1 more", "Then: git commit"}));
    Git({"add", "-A"});
    EXPECT_EQ(NextSteps(Found(), "merge"), Words{"Next: git commit"});
    Git({"commit", "-qm", "merged"});
    EXPECT_EQ(NextSteps(Found(), "stash"),
              Words{"The stash is applied and was kept: \"git stash drop\" removes it"});
}

struct PagerTest : GitFolder {
    const Variable named{"GIT_PAGER", {}}, general{"PAGER", {}};
};

TEST_F(PagerTest, IsTheOneThatGitWouldUse) {
    const Variable pager("PAGER", "more");
    EXPECT_EQ(ChosenPager(), "more");
    Git({"config", "core.pager", "less -S"});
    EXPECT_EQ(ChosenPager(), "less -S");
    const Variable ofGit("GIT_PAGER", "cat");
    EXPECT_EQ(ChosenPager(), "");
    const Variable path("PATH", "/nowhere");
    EXPECT_EQ(ChosenPager(), "more");
}

TEST_F(PagerTest, GetsAllThatIsWrittenUntilItIsLeft) {
    const std::string text(300'000, 'x');
    {
        Pager pager("cat >shown; echo $LESS >>shown");
        EXPECT_TRUE(pager.Write(text) && pager.Write("\n"));
    }
    EXPECT_EQ(folder.Read("shown"), text + "\nFRX\n");
    Pager left("true");
    for (int i = 0; i < 100 && left.Write(text); ++i) {
    }
    EXPECT_FALSE(left.Write("more"));
}

/// Old enough to be nobody's, unless a process holds it.
TEST(TemporaryFiles, AreForgottenOnesOfMergesAlone) {
    const auto make = [](std::string name, int hours) {
        EXPECT_TRUE(Descriptor(mkstemp(name.data())).IsOpen());
        const auto now = std::filesystem::file_time_type::clock::now();
        std::filesystem::last_write_time(name, now - std::chrono::hours(hours));
        return name;
    };
    const std::string old = make(kTempFileTemplate, 2), held = make(kTempFileTemplate, 2),
                      young = make(kTempFileTemplate, 0),
                      other = make(std::string(kTempFileTemplate) + "XXXXXX", 2);
    const Descriptor holds = OpenFile(held.c_str(), O_RDONLY);
    const Words found = ForgottenTemporaryFiles();
    EXPECT_TRUE(std::ranges::count(found, old));
    for (const std::string& name : {held, young, other})
        EXPECT_FALSE(std::ranges::count(found, name)) << name;
    for (const std::string& name : {old, held, young, other}) std::filesystem::remove(name);
}

/// What stands on a terminal after some work. The terminal is standard error for as long.
template <class Work> std::string OnTerminal(const Work& work) {
    const Descriptor terminal(posix_openpt(O_RDWR | O_NOCTTY));
    if (!terminal.IsOpen() || grantpt(terminal.Get()) != 0 || unlockpt(terminal.Get()) != 0)
        return "no terminal";
    {
        const Descriptor before(dup(STDERR_FILENO)),
            side = OpenFile(ptsname(terminal.Get()), O_RDWR | O_NOCTTY);
        dup2(side.Get(), STDERR_FILENO);
        work();
        dup2(before.Get(), STDERR_FILENO);
    }
    std::string shown;
    char bytes[4096];
    for (ssize_t count; (count = read(terminal.Get(), bytes, sizeof(bytes))) > 0;)
        shown.append(bytes, static_cast<std::size_t>(count));
    return shown;
}

TEST(Progress, IsSilentForShortWorkAndWithoutATerminal) {
    const auto work = [] {
        ProgressLine line("a");
        line.Begin("Read base");
        ProgressCount count;
        count.Tell("1 of 2");
    };
    testing::internal::CaptureStderr();
    work();
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "");
    const std::string shown = OnTerminal(work);
    EXPECT_TRUE(shown.empty() || shown == "no terminal") << shown;
}

TEST(Progress, LineIsShownFromTheSecondSecondOnAndWiped) {
    const std::string shown = OnTerminal([] {
        ProgressLine line("a.ovrin");
        ProgressCount count;
        line.Begin("Read base");
        std::this_thread::sleep_for(std::chrono::milliseconds(1300));
        line.Wipe();
        count.Tell("1 of 2");
    });
    if (shown == "no terminal") GTEST_SKIP();
    EXPECT_EQ(shown, "\r\033[Ka.ovrin: reading...\r\033[K\r\033[K1 of 2\r\033[K");
}

} // namespace
