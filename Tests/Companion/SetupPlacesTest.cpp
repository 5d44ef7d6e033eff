#include "Setup/GitPlaces.h"

#include "ErrorOf.h"
#include "Setup/OtherSetups.h"
#include "Setup/ProgramCall.h"
#include "Setup/SetupRun.h"
#include "Setup/UserFolders.h"
#include "Support/GitFolder.h"
#include "Words/Failure.h"

namespace {

using namespace ovrin;
using failures::ErrorOf;
using surroundings::Variable;
using Paths = std::vector<std::string>;

struct SetupPlacesTest : GitFolder {
    std::string InHome(const std::string& name) const { return (home.Path() / name).string(); }
    std::string InTree(const std::string& name) const { return (folder.Path() / name).string(); }
};

TEST_F(SetupPlacesTest, ConfigurationOfTheUserIsTheOneThatGitWrites) {
    EXPECT_EQ(GitConfigs(Scope::Global), (Paths{InHome(".gitconfig"), InHome(".config/git/config")}));
    home.Folder().Write(".config/git/config", "");
    EXPECT_EQ(GitConfigs(Scope::Global).front(), InHome(".config/git/config"));
    home.Folder().Write(".gitconfig", "");
    EXPECT_EQ(GitConfigs(Scope::Global).front(), InHome(".gitconfig"));
    const Variable settings("XDG_CONFIG_HOME", "/settings");
    EXPECT_EQ(GitConfigs(Scope::Global).back(), "/settings/git/config");
    const Variable named("GIT_CONFIG_GLOBAL", "named");
    EXPECT_EQ(GitConfigs(Scope::Global), Paths{InTree("named")});
    const Variable none("GIT_CONFIG_GLOBAL", "/dev/null");
    EXPECT_THROW(GitConfigs(Scope::Global), Failure);
}

TEST_F(SetupPlacesTest, AttributesOfTheUserAreWhereGitReadsThem) {
    EXPECT_EQ(GitAttributes(Scope::Global), Paths{InHome(".config/git/attributes")});
    Git({"config", "--global", "core.attributesFile", "~/attributes"});
    EXPECT_EQ(GitAttributes(Scope::Global), (Paths{InHome("attributes"), InHome(".config/git/attributes")}));
    EXPECT_EQ(GitAttributes(Scope::Local), Paths{InTree(".git/info/attributes")});
}

TEST_F(SetupPlacesTest, LinkedTreesShareAConfiguration) {
    Commit({{"a", "1"}});
    Git({"worktree", "add", "-q", "tree"});
    const surroundings::Here tree("tree");
    EXPECT_EQ(GitConfigs(Scope::Local), Paths{InTree(".git/config")});
    EXPECT_EQ(GitHooks(), InTree(".git/hooks"));
}

TEST_F(SetupPlacesTest, HooksAreWhereGitRunsThem) {
    std::filesystem::create_directory("sub");
    for (const auto& [path, folder] : {std::pair<std::string, std::string>{"my/hooks", InTree("my/hooks")},
                                       {"/shared/../all", "/all"},
                                       {"~/hooks", InHome("hooks")}}) {
        Git({"config", "core.hooksPath", path});
        const surroundings::Here below("sub");
        EXPECT_EQ(GitHooks(), folder);
    }
    Git({"config", "--unset", "core.hooksPath"});
    Git({"config", "core.bare", "true"});
    EXPECT_EQ(GitHooks(), "");
}

TEST_F(SetupPlacesTest, EntriesAreThoseThatGitReads) {
    EXPECT_EQ(EntriesOfGitConfig(""), Paths{});
    EXPECT_EQ(EntriesOfGitConfig("[a \"b\"]\n\tX = \"1\\n2\" # note\n[c]\n\ty\n"),
              (Paths{"a.b.x\n1\n2", "c.y"}));
    EXPECT_THROW(EntriesOfGitConfig("[a\n"), Failure);
}

TEST_F(SetupPlacesTest, HomeMustBeAPlace) {
    for (const auto& [home, told] : {std::pair<const char*, const char*>{"", "not set"},
                                     {"relative", "\"relative\", which is no absolute path"}}) {
        const Variable variable("HOME", home);
        EXPECT_EQ(ErrorOf<Failure>([] { HomeFor("git"); }),
                  std::string("HOME is ") + told + ", so that git has no settings of the user: set HOME");
    }
    const Variable slashes("HOME", "/a//");
    EXPECT_EQ(HomeFor("git"), "/a");
    EXPECT_EQ(SettingsFolderFor("git"), "/a/.config");
}

TEST_F(SetupPlacesTest, ProgramIsCalledAsOneWishesOrByWhereItStands) {
    EXPECT_EQ(CallOfThisProgram("my ovrin").ForShell(), "'my ovrin'");
    EXPECT_EQ(CallOfThisProgram("/opt/ovrin").ForSubversion(), "/opt/ovrin-svn");
    EXPECT_TRUE(CallOfThisProgram().name.ends_with("/ovrin"));
}

TEST(SubversionTool, IsFoundAsSubversionFindsIt) {
    for (const auto& [text, tool] : {std::pair{"", ""},
                                     {"[helpers]\nmerge-tool-cmd = a b\n", "a b"},
                                     {"[Helpers]\r\nMerge-Tool-Cmd:x\r\n", "x"},
                                     {"[helpers]\n# merge-tool-cmd = x\n", ""},
                                     {"[other]\nmerge-tool-cmd = x\n", ""},
                                     {"[helpers]\nmerge-tool-cmd = x\n[other]\nmerge-tool-cmd = y\n", "x"},
                                     {"[helpers]\nmerge-tool-cmd =\n", ""},
                                     {"[helpers", ""}})
        EXPECT_EQ(MergeToolOfSubversion(text), tool) << text;
    for (const char* tool : {"ovrin-svn", "/opt/x/ovrin-svn"}) EXPECT_TRUE(IsOurToolOfSubversion(tool));
    for (const char* tool : {"", "ovrin", "ovrin-svn x", "my-ovrin-svn"})
        EXPECT_FALSE(IsOurToolOfSubversion(tool)) << tool;
}

struct SetupRunTest : SetupPlacesTest {
    /// What stands below the home, with its contents.
    std::string Home() const {
        return OutputOf(
            {"sh", "-c", "cd && find . -type f | sort | xargs -r tail -n +1; find . -type d | sort"});
    }
};

TEST_F(SetupRunTest, SettingUpTwiceChangesNothingMoreAndUndoLeavesNoTrace) {
    home.Folder().Write(".gitconfig", "[user]\n\tname = A");
    const std::string before = Home();
    EXPECT_EQ(RunSetup({.system = "git", .program = "ovrin"}).changed,
              (Paths{InHome(".gitconfig"), InHome(".config/git/attributes")}));
    EXPECT_TRUE(RunSetup({.system = "git", .program = "ovrin"}).changed.empty());
    EXPECT_EQ(RunSetup({.system = "git", .program = "/opt/ovrin"}).changed, Paths{InHome(".gitconfig")});
    EXPECT_EQ(RunSetup({.system = "git", .isUndo = true}).failures, 0u);
    EXPECT_EQ(Home(), before);
    EXPECT_EQ(RunSetup({.system = "git", .isUndo = true}).words, "There is nothing that setup wrote here.\n");
}

TEST_F(SetupRunTest, DryRunTellsTheSameAndWritesNothing) {
    const std::string before = Home();
    const SetupReport dry = RunSetup({.system = "git", .isDryRun = true, .program = "ovrin"});
    EXPECT_EQ(Home(), before);
    const SetupReport real = RunSetup({.system = "git", .program = "ovrin"});
    EXPECT_EQ(dry.done, real.done);
    EXPECT_EQ(dry.changed, real.changed);
    EXPECT_NE(real.done.find("git: " + InHome(".gitconfig") +
                             " is made, with these lines:\n    [merge \"ovrin\"]\n"),
              std::string::npos);
}

TEST_F(SetupRunTest, FileThatFailsStopsNoOther) {
    home.Folder().Write(".gitconfig", "[torn\n");
    std::filesystem::create_directories(home.Path() / ".config/git");
    const SetupReport report = RunSetup({.system = "git", .program = "ovrin"});
    EXPECT_GE(report.failures, 1u);
    EXPECT_EQ(home.Folder().Read(".gitconfig"), "[torn\n");
}

TEST_F(SetupRunTest, NothingToSetUpIsAFailure) {
    EXPECT_THROW(RunSetup({.system = "svn", .scope = Scope::Local}), Failure);
    const Variable path("PATH", "/nowhere");
    for (const char* system : {"git", "hg", "svn", ""})
        EXPECT_THROW(RunSetup({.system = system}), Failure) << system;
}

TEST_F(SetupRunTest, LocalSetUpNeedsARepository) {
    const surroundings::Here outside(home.Path());
    EXPECT_NE(ErrorOf<Failure>([] {
                  RunSetup({.system = "", .scope = Scope::Local});
              }).find("no repository around this folder"),
              std::string::npos);
}

TEST_F(SetupRunTest, ToolOfAnotherIsNotTakenFromSubversion) {
    surroundings::FakePrograms programs;
    programs.Say("svn", "", "");
    programs.Say("ovrin-svn", "", "");
    const std::string config = "[helpers]\nmerge-tool-cmd = other\n";
    home.Folder().Write(".subversion/config", config);
    const SetupReport report = RunSetup({.system = "svn", .program = "ovrin"});
    EXPECT_EQ(report.failures, 1u);
    EXPECT_NE(report.words.find("merge-tool-cmd = other already"), std::string::npos) << report.words;
    EXPECT_NE(report.words.find("or call ovrin-svn from there"), std::string::npos) << report.words;
    const std::string missing = RunSetup({.system = "svn", .program = "nowhere"}).words;
    EXPECT_EQ(missing.find("nowhere-svn"), missing.rfind("nowhere-svn")) << missing;
    EXPECT_EQ(home.Folder().Read(".subversion/config"), config);
    std::filesystem::remove(home.Path() / ".subversion/config");
    EXPECT_EQ(RunSetup({.system = "svn", .program = "ovrin"}).failures, 0u);
    EXPECT_EQ(MergeToolOfSubversion(home.Folder().Read(".subversion/config")), "ovrin-svn");
}

TEST_F(SetupRunTest, MercurialGetsItsToolByPatterns) {
    surroundings::FakePrograms programs;
    programs.Say("hg", "root", folder.Path().string() + "\n");
    RunSetup({.system = "hg", .program = "/a b/ovrin"});
    EXPECT_NE(home.Folder().Read(".hgrc").find(
                  "\novrin.args = '/a b/ovrin' merge -- $base $local $other $output $output\n"),
              std::string::npos);
    RunSetup({.system = "hg", .scope = Scope::Local, .program = "ovrin"});
    EXPECT_NE(folder.Read(".hg/hgrc").find("\n**.prefab = ovrin\n"), std::string::npos);
    const Variable merge("HGMERGE", "x");
    EXPECT_NE(RunSetup({.system = "hg"}).words.find("HGMERGE is set to x"), std::string::npos);
}

} // namespace
