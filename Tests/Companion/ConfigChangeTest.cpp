#include "Setup/ConfigChange.h"

#include "ErrorOf.h"
#include "Setup/GitSetup.h"
#include "Setup/ProgramCall.h"
#include "Support/GitFolder.h"
#include "Words/Failure.h"

#include <algorithm>

namespace {

using namespace ovrin;
using failures::ErrorOf;
using Kind = ConfigChange::Kind;
namespace fs = std::filesystem;

struct ConfigChangeTest : testing::Test {
    Configuration File(FileKind kind = FileKind::Lines, const std::string& lines = "one\ntwo\n",
                       const std::string& name = "file") const {
        return {"git", (folder.Path() / name).string(), lines, kind, {}};
    }
    /// Plans and does it.
    static Kind Add(const Configuration& file) {
        const ConfigChange change = PlanLines(file);
        CarryOut(change);
        return change.kind;
    }
    static Kind Undo(const Configuration& file) {
        const ConfigChange change = PlanRemoval(file);
        CarryOut(change);
        return change.kind;
    }
    std::string Text(const std::string& name = "file") const { return folder.Read(name); }
    void Replace(const std::string& what, const std::string& with) const {
        std::string text = Text();
        text.replace(text.find(what), what.size(), with);
        folder.Write("file", text);
    }

    const program::WorkingDirectory folder;
};

constexpr FileKind kKinds[] = {FileKind::GitConfig, FileKind::Sections, FileKind::Lines};

TEST_F(ConfigChangeTest, UndoGivesEveryByteBack) {
    for (const std::string text :
         {"", "a", "a\n", "a\r\n", "a\r\nb", "\n\n", "a\r", "a\rb\r", "\r", "\xef\xbb\xbf[a]\n", "a\0b"})
        for (const FileKind kind : kKinds) {
            folder.Write("file", text);
            EXPECT_EQ(Add(File(kind)), Kind::Add);
            EXPECT_EQ(Add(File(kind)), Kind::None);
            EXPECT_EQ(Add(File(kind, "three\n")), Kind::Replace);
            EXPECT_EQ(Undo(File(kind, "three\n")), Kind::Remove);
            EXPECT_EQ(Text(), text);
            EXPECT_EQ(Undo(File(kind)), Kind::None);
        }
}

TEST_F(ConfigChangeTest, FileThatWasMadeGoesWithItsFolders) {
    const Configuration file = File(FileKind::Lines, "one\n", "a/b/c/file");
    fs::create_directory(folder.Path() / "a");
    EXPECT_EQ(Add(file), Kind::Make);
    EXPECT_EQ(Undo(file), Kind::Delete);
    EXPECT_TRUE(fs::is_empty(folder.Path() / "a"));
}

TEST_F(ConfigChangeTest, FileThatWasMadeStaysForWhatOthersWroteIntoIt) {
    Add(File());
    folder.Write("file", Text() + "theirs\n");
    EXPECT_EQ(Undo(File()), Kind::Remove);
    EXPECT_EQ(Text(), "theirs\n");
}

TEST_F(ConfigChangeTest, LinesOfOthersAmongOursAreKept) {
    folder.Write("file", "[first]\n");
    const Configuration file = File(FileKind::GitConfig, "[own]\n\tone = 1\n");
    Add(file);
    Replace("\tone = 1\n", "\tone = 1\n\ttheirs = 2\n[theirs]\n\tx = 3\n");
    const std::string kept = "[own]\n\ttheirs = 2\n[theirs]\n\tx = 3\n";
    EXPECT_EQ(PlanLines(file).kept, kept);
    EXPECT_EQ(Undo(file), Kind::Remove);
    EXPECT_EQ(Text(), "[first]\n" + kept);
}

TEST_F(ConfigChangeTest, NothingIsWrittenOverWhatChangedMeanwhile) {
    folder.Write("file", "a\n");
    const ConfigChange change = PlanLines(File());
    folder.Write("file", "b\n");
    EXPECT_THROW(CarryOut(change), Failure);
    EXPECT_EQ(Text(), "b\n");
    fs::remove(folder.Path() / "file");
    EXPECT_THROW(CarryOut(change), Failure);
    EXPECT_EQ(Text(), "<missing>");
}

TEST_F(ConfigChangeTest, CheckThatFailsKeepsTheFile) {
    folder.Write("file", "a\n");
    Configuration file = File();
    file.check = [](const std::string& before, const std::string& after) {
        EXPECT_TRUE(before == "a\n" && after.starts_with("a\n# >>>"));
        throw Failure("no");
    };
    EXPECT_EQ(ErrorOf<Failure>([&] { Add(file); }), "no");
    EXPECT_EQ(Text(), "a\n");
}

TEST_F(ConfigChangeTest, FileThatCantBeReadIsNotTakenForNone) {
    fs::create_directory(folder.Path() / "file");
    EXPECT_NE(ErrorOf<Failure>([&] { PlanLines(File()); }).find("Cannot read "), std::string::npos);
    EXPECT_THROW(PlanRemoval(File()), Failure);
}

TEST_F(ConfigChangeTest, LinkStaysALink) {
    folder.Write("real", "a\n");
    fs::create_symlink("real", folder.Path() / "file");
    Add(File());
    EXPECT_NE(Text("real"), "a\n");
    Undo(File());
    EXPECT_EQ(Text("real"), "a\n");
    EXPECT_TRUE(fs::is_symlink(folder.Path() / "file"));
}

struct ScriptTest : ConfigChangeTest {
    void Put(const std::string& text, bool isExecutable = true) const {
        folder.Write("file", text);
        fs::permissions(folder.Path() / "file", isExecutable ? fs::perms::owner_all : fs::perms::owner_read);
    }
    const Configuration script = File(FileKind::Script, "echo ours\n");
};

TEST_F(ScriptTest, NewOneCanBeRunAndGoesAgain) {
    EXPECT_EQ(Add(script), Kind::Make);
    EXPECT_EQ(OutputOf({script.path}), "ours\n");
    EXPECT_EQ(Undo(script), Kind::Delete);
    EXPECT_EQ(Text(), "<missing>");
}

TEST_F(ScriptTest, LinesComeBehindThatOfAnyShell) {
    for (const std::string shell :
         {"#!/bin/sh", "#! /bin/bash -e", "#!/usr/bin/env bash", "#!/usr/bin/env -S A=1 zsh"}) {
        const std::string text = shell + "\nexit 3\n";
        Put(text);
        Add(script);
        EXPECT_TRUE(Text().starts_with(shell + "\n# >>> ovrin setup")) << shell;
        Undo(script);
        EXPECT_EQ(Text(), text);
    }
}

TEST_F(ScriptTest, OthersAreLeftAlone) {
    for (const std::string text :
         {"", "echo a\n", "#!/usr/bin/python3\n", "#!/usr/bin/env python3\n", "#!/bin/sh\r\necho a\r\n",
          "#!/bin/sh\recho a", "#!\n", "#!/usr/bin/env\n"}) {
        Put(text);
        EXPECT_THROW(PlanLines(script), Failure) << testing::PrintToString(text);
    }
    Put("#!/bin/sh\n", false);
    EXPECT_NE(ErrorOf<Failure>([&] { PlanLines(script); }).find("chmod +x"), std::string::npos);
}

TEST_F(ScriptTest, WhatSomebodyChangedIsTakenOutByHand) {
    Put("#!/bin/sh\n");
    Add(script);
    Replace("echo ours", "echo theirs");
    EXPECT_THROW(PlanRemoval(script), Failure);
    EXPECT_THROW(PlanLines(script), Failure);
}

TEST(ShellWord, IsOneWordForAShell) {
    for (const std::string& word :
         {std::string("ovrin"), std::string(), std::string("a b"), std::string("it's '' \"q\""),
          std::string("$HOME `x` \\ *?[~#;&|<>(){}!"), std::string("line\nline"), std::string("-n"),
          std::string("ä\xff"), std::string("%S")})
        EXPECT_EQ(OutputOf({"sh", "-c", "printf %s\\\\n " + ShellWord(word)}), word + "\n");
    EXPECT_EQ(ShellWord("/usr/bin/a-b_c.d+e,f:g@h"), "/usr/bin/a-b_c.d+e,f:g@h");
}

/// Whatever the program is called, git reads the call that was meant.
struct GitSetupTest : GitFolder {
    static const Configuration& FileOf(const SystemSetup& setup, FileKind kind) {
        return *std::ranges::find(setup.files, kind, &Configuration::kind);
    }
};

TEST_F(GitSetupTest, DriverHasTheCallWithItsSignsDoubled) {
    for (const std::string name :
         {"ovrin", "/opt/a b/ovrin", "/a\"b\\c;d#e/ovrin", "/50%/ovrin", "/it's/ovrin"}) {
        const SystemSetup setup = SetupOfGit(Scope::Local, {name});
        CarryOut(PlanLines(FileOf(setup, FileKind::GitConfig)));
        std::string call = Git({"config", "merge.ovrin.driver"});
        call = call.substr(0, call.find(" merge --base-label "));
        for (std::size_t at = 0; (at = call.find("%%", at)) != std::string::npos; ++at) call.erase(at, 1);
        EXPECT_EQ(call, ShellWord(name));
        EXPECT_EQ(Git({"config", "mergetool.ovrin.cmd"}), ShellWord(name) + " settle -- \"$MERGED\"");
    }
}

TEST_F(GitSetupTest, AttributesGiveAllScenesToTheDriver) {
    CarryOut(PlanLines(FileOf(SetupOfGit(Scope::Local, {"ovrin"}), FileKind::Lines)));
    for (const char* name : {"a.ovrin", "d/b.prefab", "c.png.meta"})
        EXPECT_EQ(Git({"check-attr", "merge", "--", name}), std::string(name) + ": merge: ovrin");
    EXPECT_EQ(Git({"check-attr", "merge", "--", "a.txt"}), "a.txt: merge: unspecified");
}

TEST_F(GitSetupTest, LocalSetUpAndItsUndoLeaveTheRepositoryAsItWas) {
    const auto look = [] {
        return OutputOf({"sh", "-c", "find .git -type f -exec cksum {} + | sort; find .git -type d | sort"});
    };
    for (const std::string more : {"", "[user]\n\tname = A", "[alias]\r\n\tx = y\r\n"}) {
        folder.Write(".git/config", folder.Read(".git/config") + more);
        const std::string before = look();
        for (const Configuration& file : SetupOfGit(Scope::Local, {"ovrin"}).files) CarryOut(PlanLines(file));
        EXPECT_NE(look(), before);
        for (const Configuration& file : RemovalFromGit(Scope::Local, {"ovrin"}).files)
            CarryOut(PlanRemoval(file));
        EXPECT_EQ(look(), before);
    }
}

TEST_F(GitSetupTest, LastLineThatGoesOnTakesNoLinesOfOurs) {
    folder.Write(".git/config", "[a]\n\tx = y\\\n");
    const std::string failure =
        ErrorOf<Failure>([] { PlanLines(FileOf(SetupOfGit(Scope::Local, {"ovrin"}), FileKind::GitConfig)); });
    EXPECT_NE(failure.find("look at its last line"), std::string::npos) << failure;
}

TEST_F(GitSetupTest, WhatOthersSayOfScenesIsNoticed) {
    Git({"config", "merge.ovrin.driver", "another"});
    folder.Write(".git/info/attributes", "*.prefab merge=union\n*.txt merge=union\n");
    std::string notices;
    for (const std::string& notice : SetupOfGit(Scope::Local, {"ovrin"}).notices) notices += notice + "\n";
    EXPECT_NE(notices.find("has another driver = another;"), std::string::npos) << notices;
    EXPECT_NE(notices.find("also says \"*.prefab merge=union\""), std::string::npos) << notices;
    EXPECT_EQ(notices.find("*.txt"), std::string::npos) << notices;
}

} // namespace
