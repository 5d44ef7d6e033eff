#include "Doctor/Examination.h"
#include "Doctor/GitChecks.h"
#include "Doctor/MachineChecks.h"
#include "Doctor/Patient.h"
#include "Doctor/SceneChecks.h"
#include "Doctor/SetupFix.h"

#include "Conflicts/OpenMerges.h"
#include "ErrorOf.h"
#include "Setup/SetupRun.h"
#include "Support/GitFolder.h"
#include "Words/Failure.h"

#include <algorithm>
#include <set>

namespace {

using namespace ovrin;
using failures::ErrorOf;
using surroundings::Variable;

const std::string kScene = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n--- !o!1 &1\nGameObject:\n  m_Name: a\n";

/// "state: text" and the cure.
std::string Told(const Diagnosis& found) {
    return std::string(HealthName(found.health)) + ": " + found.text +
           (found.cure.empty() ? "" : ". Cure: " + found.cure);
}

/// A user in a repository of git, in which nothing is set up.
struct DoctorTest : GitFolder {
    using Check = Diagnosis (*)(Patient&);

    static Diagnosis Look(Check check) {
        Patient patient;
        return check(patient);
    }
    static std::string State(Check check) { return HealthName(Look(check).health); }
    static void SetUp(const std::string& name = "ovrin") { RunSetup({.system = "git", .program = name}); }
    /// Does what the check offers. Returns what it says of it.
    static std::string Fix(Check check) {
        Patient patient;
        return check(patient).fix();
    }
    static bool Has(const std::string& text, const std::string& part) {
        return text.find(part) != std::string::npos;
    }
};

// There is none beside these tests.
TEST_F(DoctorTest, ListOfToolsThatIsMissingIsTold) {
    EXPECT_TRUE(
        Has(Look(LookAtMergeTools).text, "mergespecfile.txt, which names the merge tools, is missing"));
}

TEST_F(DoctorTest, VersionsOfGitAreJudgedByWhatTheyCanDo) {
    surroundings::FakePrograms programs;
    for (const auto& [told, state] : {std::pair{"git version 2.37.9", "problem"},
                                      {"git version 2.38.0", "note"},
                                      {"git version 2.43.7", "note"},
                                      {"git version 2.44.0.rc1", "ok"},
                                      {"git version 3.0", "ok"},
                                      {"git version 1.44", "problem"}}) {
        programs.Say("git", "--version", told);
        EXPECT_EQ(State(LookAtGitVersion), state) << told;
    }
    programs.Say("git", "--version", "?");
    EXPECT_THROW(Look(LookAtGitVersion), Failure);
}

TEST_F(DoctorTest, WithoutTheSystemsThereIsNothingToLookAt) {
    const Variable path("PATH", "/nowhere");
    for (const Check check : {LookAtGitVersion, LookAtGitDriver, LookAtGitAttributes, LookAtGitPath,
                              LookAtGuard, LookAtOldSetup, LookAtMercurial, LookAtSubversion})
        EXPECT_EQ(State(check), "skipped");
}

TEST_F(DoctorTest, DriverIsMissedWhereThereAreScenes) {
    EXPECT_EQ(State(LookAtGitDriver), "note");
    Commit({{"a.ovrin", kScene}});
    EXPECT_EQ(Told(Look(LookAtGitDriver)),
              "problem: git is not set up: it merges scenes by lines. Cure: ovrin setup git");
    folder.Write(".gitattributes", "*.ovrin merge=ovrin\n");
    EXPECT_TRUE(Has(Look(LookAtGitDriver).text, "which is missing"));
    SetUp();
    EXPECT_EQ(State(LookAtGitDriver), "ok");
}

TEST_F(DoctorTest, DriverOfAnotherProgramIsToldAndReplaced) {
    Git({"config", "--global", "merge.ovrin.driver", "other %O %A %B"});
    EXPECT_TRUE(
        Has(Told(Look(LookAtGitDriver)), "than set-up writes: other %O %A %B. Cure: ovrin setup git"));
    EXPECT_TRUE(Has(Fix(LookAtGitDriver), "\"ovrin setup git\" changed "));
    EXPECT_EQ(State(LookAtGitDriver), "ok");
    Git({"config", "merge.ovrin.driver", "of this repository"});
    EXPECT_EQ(Look(LookAtGitDriver).cure, "ovrin setup git --local");
}

TEST_F(DoctorTest, ConfigurationThatCantBeReadIsNotTakenForNone) {
    home.Folder().Write(".gitconfig", "[torn\n");
    EXPECT_THROW(Look(LookAtOldSetup), Failure);
    EXPECT_THROW(Look(LookAtGitDriver), Failure);
    surroundings::FakePrograms programs;
    programs.Say("hg", "config", "", 255);
    EXPECT_THROW(Look(LookAtMercurial), Failure);
}

TEST_F(DoctorTest, AttributesThatTakeScenesAwayAreNamed) {
    Commit({{"a.ovrin", kScene}, {"b.ovrin", kScene}, {"c.ovrin", kScene}});
    EXPECT_EQ(State(LookAtGitAttributes), "skipped");
    SetUp();
    EXPECT_EQ(State(LookAtGitAttributes), "ok");
    folder.Write(".gitattributes", "[bc].ovrin merge=union\n");
    EXPECT_TRUE(Has(Look(LookAtGitAttributes).text, "\"merge: union\" for 2 scenes, the first b.ovrin, not"));
    EXPECT_FALSE(Look(LookAtGitAttributes).fix);
    std::filesystem::remove(home.Path() / ".config/git/attributes");
    folder.Write(".gitattributes", "");
    EXPECT_TRUE(
        Has(Look(LookAtGitAttributes).text, "no attributes give 3 scenes, the first a.ovrin to the driver"));
}

TEST_F(DoctorTest, ProgramThatGitDoesntFindIsTold) {
    SetUp("/nowhere/my ovrin");
    EXPECT_EQ(Told(Look(LookAtGitPath)), "problem: git doesn't find '/nowhere/my ovrin', the program that it "
                                         "is to call. Cure: ovrin setup git");
    SetUp("ls");
    EXPECT_EQ(Told(Look(LookAtGitPath)), "ok: git finds ls");
    surroundings::FakePrograms programs;
    programs.Say("my-ovrin", "", "");
    SetUp("my-ovrin");
    EXPECT_TRUE(
        Has(Told(Look(LookAtGitPath)), "note: git finds my-ovrin on your path, but programs with windows"));
}

TEST_F(DoctorTest, GuardIsAHookThatCanBeRun) {
    EXPECT_EQ(Look(LookAtGuard).cure, "ovrin setup git --local");
    folder.Write(".git/hooks/pre-commit", "#!/bin/sh\novrin status --guard\n");
    EXPECT_EQ(Look(LookAtGuard).cure, "chmod +x " + folder.Path().string() + "/.git/hooks/pre-commit");
    std::filesystem::permissions(".git/hooks/pre-commit", std::filesystem::perms::owner_all);
    EXPECT_EQ(State(LookAtGuard), "ok");
    folder.Write(".git/hooks/pre-commit", "exec pre-commit run\n");
    EXPECT_EQ(State(LookAtGuard), "note");
    folder.Write(".pre-commit-config.yaml", "- id: ovrin-guard\n");
    EXPECT_EQ(State(LookAtGuard), "ok");
}

TEST_F(DoctorTest, LinesOfEarlierVersionsAreTakenOutAndNoOthers) {
    EXPECT_EQ(State(LookAtOldSetup), "ok");
    const std::string before = "[include]\n\tpath = /mine\n[alias]\n\ta = b\n";
    home.Folder().Write(".gitconfig", before);
    Git({"config", "--global", "--add", "include.path", "/usr/share/ovrinmerge/gitconfig"});
    Git({"config", "merge.old.driver", "ovrinmerge-vcs %O (%A)"});
    EXPECT_TRUE(Has(Told(Look(LookAtOldSetup)), "has include.path = /usr/share/ovrinmerge/gitconfig, and 1 "
                                                "more are of an earlier version. Cure: git config --file"));
    EXPECT_TRUE(Fix(LookAtOldSetup).starts_with("taken out: "));
    EXPECT_EQ(home.Folder().Read(".gitconfig"), before);
    EXPECT_EQ(State(LookAtOldSetup), "ok");
}

TEST_F(DoctorTest, LineEndsThatGitChangesAreTold) {
    Commit({{"a.ovrin", kScene}});
    EXPECT_EQ(State(LookAtLineEnds), "ok");
    const struct {
        const char *autocrlf, *eol, *attributes, *state;
    } cases[] = {
        {"true", "lf", "", "problem"},
        {"input", "lf", "", "problem"},
        {"true", "lf", "* -text", "ok"},
        {"false", "crlf", "", "ok"},
        {"false", "crlf", "* text", "problem"},
        {"false", "lf", "* text", "ok"},
        {"false", "lf", "* eol=crlf", "problem"},
        {"true", "lf", "* text eol=lf", "ok"},
        {"false", "crlf", "* text=auto", "problem"},
    };
    for (const auto& [autocrlf, eol, attributes, state] : cases) {
        Git({"config", "core.autocrlf", autocrlf});
        Git({"config", "core.eol", eol});
        folder.Write(".gitattributes", std::string(attributes) + "\n");
        EXPECT_EQ(State(LookAtLineEnds), state) << autocrlf << " " << eol << " " << attributes;
    }
}

TEST_F(DoctorTest, ScenesOfOtherFormsAreNamed) {
    Commit({{"a.ovrin", kScene}});
    for (const Check check : {LookAtLineEnds, LookAtLfs, LookAtTagAuthority}) EXPECT_EQ(State(check), "ok");
    folder.Write("a.ovrin", "%YAML 1.1\r\n");
    EXPECT_TRUE(Has(Look(LookAtLineEnds).text, "a.ovrin has \"\\r\\n\""));
    folder.Write("a.ovrin", "version https://git-lfs.github.com/spec/v1\noid sha256:" + std::string(64, '0') +
                                "\nsize 1\n");
    EXPECT_TRUE(Has(Look(LookAtLfs).text, "Git LFS keeps a.ovrin"));
    folder.Write("a.ovrin", "%YAML 1.1\n%TAG !o! tag:\x1b.example,2011:\n");
    EXPECT_TRUE(Has(Look(LookAtTagAuthority).text,
                    "the second line of a.ovrin names \\x1b.example, but this build writes"));
}

TEST_F(DoctorTest, NotesOfMergesThatAreOverAreRemoved) {
    EXPECT_EQ(State(LookAtOpenConflicts), "ok");
    OpenMerge merge;
    merge.path = "a.ovrin";
    merge.occasion.action = "merge";
    OpenMerges(Found()).Add(merge);
    EXPECT_EQ(Told(Look(LookAtOpenConflicts)),
              "problem: notes of 1 merges are left that are over. Cure: ovrin doctor --fix");
    EXPECT_EQ(Fix(LookAtOpenConflicts), "1 notes were removed");
    EXPECT_EQ(State(LookAtOpenConflicts), "ok");
}

TEST_F(DoctorTest, OtherSystemsAreJudgedByTheToolThatTheyName) {
    surroundings::FakePrograms programs;
    programs.Say("svn", "", "");
    programs.Say("ovrin-svn", "", "");
    const auto mercurial = [&](const std::string& arguments, int status = 0) {
        programs.Say("hg", "config", arguments + "\n", status);
        return Told(Look(LookAtMercurial));
    };
    EXPECT_EQ(mercurial("", 1), "note: Mercurial is not set up to merge scenes. Cure: ovrin setup hg");
    EXPECT_TRUE(Has(mercurial("other $base"), "than set-up writes: other $base"));
    EXPECT_TRUE(Has(mercurial("/nowhere/o merge -- $base $local"),
                    "Mercurial is to call /nowhere/o, which is not there"));
    EXPECT_EQ(mercurial("ls merge -- $base $local"), "ok: Mercurial merges scenes with ls");
    const auto subversion = [&](const std::string& tool) {
        home.Folder().Write(".subversion/config", "[helpers]\nmerge-tool-cmd = " + tool + "\n");
        return Told(Look(LookAtSubversion));
    };
    EXPECT_TRUE(Has(subversion("/x/ovrinmerge-vcs"), "of an earlier version"));
    EXPECT_TRUE(Has(subversion("other"), "has another merge tool: other"));
    EXPECT_TRUE(Has(subversion("/nowhere/ovrin-svn"), "which is not there"));
    EXPECT_EQ(subversion("ovrin-svn"), "ok: Subversion merges with ovrin-svn");
    const Variable merge("HGMERGE", "x"), other("SVN_MERGE", "y");
    EXPECT_TRUE(Has(mercurial("ls merge -- $base $local"), "HGMERGE is set to x"));
    EXPECT_TRUE(Has(subversion("ovrin-svn"), "SVN_MERGE is set to y"));
}

TEST_F(DoctorTest, EveryCheckHasItsCodeAndOneThatFailsHidesNoOther) {
    const std::vector<Examined> results = Examine(false);
    std::set<std::string> codes;
    for (const Examined& result : results) codes.insert(result.code);
    EXPECT_EQ(codes.size(), results.size());
    folder.Write(".git/config", "[torn\n");
    const std::vector<Examined> broken = Examine(false);
    ASSERT_EQ(broken.size(), results.size());
    EXPECT_GT(std::ranges::count_if(
                  broken, [](const Examined& result) { return result.diagnosis.health == Health::Unknown; }),
              0);
    EXPECT_LT(std::ranges::count_if(
                  broken, [](const Examined& result) { return result.diagnosis.health == Health::Unknown; }),
              static_cast<std::ptrdiff_t>(broken.size()));
}

struct FixTest : DoctorTest {
    static Diagnosis Driver(bool fix) {
        const std::vector<Examined> results = Examine(fix);
        return std::ranges::find(results, std::string("git-driver"), &Examined::code)->diagnosis;
    }
};

TEST_F(FixTest, ProblemIsFixedAndLookedAtAgain) {
    Commit({{"a.ovrin", kScene}});
    EXPECT_EQ(Driver(false).health, Health::Problem);
    EXPECT_TRUE(Has(Told(Driver(true)), "fixed: \"ovrin setup git\" changed "));
    EXPECT_EQ(Driver(true).health, Health::Fine);
}

TEST_F(FixTest, NothingIsChangedWhileGitIsAtWork) {
    Commit({{"a.ovrin", kScene}});
    folder.Write(".git/index.lock", "");
    const Diagnosis found = Driver(true);
    EXPECT_EQ(found.health, Health::Problem);
    EXPECT_TRUE(Has(found.text, "it can't be fixed: version control is at work here, as " +
                                    folder.Path().string() + "/.git/index.lock says"))
        << found.text;
    EXPECT_EQ(home.Folder().Read(".gitconfig"), "<missing>");
}

TEST(FixBySetup, ThrowsWhereSomethingIsLeftUndone) {
    const surroundings::EmptyHome home;
    home.Folder().Write(".gitconfig", "[torn\n");
    EXPECT_THROW(FixBySetup("git", Scope::Global)(), Failure);
}

} // namespace
