#include "Systems/GitFiles.h"

#include "Support/GitFolder.h"

namespace {

using namespace ovrin;

const std::string kA(40, 'a'), kB(40, 'b');

struct GitFilesTest : testing::Test {
    Repository Repo() const { return {SystemKind::Git, "/", data.Path()}; }
    std::string AtHand(const std::string& file, const std::string& text) const {
        data.Write(file, text);
        return CommitAtHand(Repo());
    }

    const surroundings::EmptyHome home;
    const program::WorkingDirectory data;
};

TEST_F(GitFilesTest, NumbersOfCommitsAreShortenedAndNamesAreNot) {
    EXPECT_EQ(ShortCommit(kA), "aaaaaaa");
    EXPECT_EQ(ShortCommit(std::string(64, 'f')), "fffffff");
    for (const std::string& name : {std::string(), std::string("main"), std::string(39, 'a'),
                                    std::string(40, 'g'), std::string(40, 'A'), kA + "\n"})
        EXPECT_EQ(ShortCommit(name), name);
}

TEST_F(GitFilesTest, HeadOfALinkedTreeIsLookedUpInWhatAllShare) {
    data.Write("shared/refs/heads/topic", kB + "\n");
    data.Write("tree/HEAD", "ref: refs/heads/topic\r\n");
    const Repository tree = {SystemKind::Git, "/", (data.Path() / "tree").string()};
    for (const std::string& shared : {std::string("../shared"), (data.Path() / "shared").string()}) {
        data.Write("tree/commondir", shared + "\n");
        EXPECT_EQ(ReadGitHead(tree).commit, kB) << shared;
        EXPECT_EQ(ReadGitHead(tree).branch, "topic");
    }
}

TEST_F(GitFilesTest, PackedReferenceIsTakenByItsWholeName) {
    data.Write("HEAD", "ref: refs/heads/main\n");
    data.Write("packed-refs",
               kA + " refs/heads/not/refs/heads/main\n" + kB + " refs/heads/main\n^" + kA + "\n");
    EXPECT_EQ(ReadGitHead(Repo()).commit, kB);
}

TEST_F(GitFilesTest, WithoutACommitThereIsTheBranch) {
    data.Write("HEAD", "ref: refs/heads/main\n");
    EXPECT_EQ(ReadGitHead(Repo()).commit, "");
    EXPECT_EQ(ReadGitHead(Repo()).branch, "main");
}

TEST_F(GitFilesTest, RebaseGoesOntoWhatItsLastStartNames) {
    EXPECT_EQ(RebaseTarget(Repo()), "");
    data.Write("rebase-apply/onto", kB + "\n");
    EXPECT_EQ(RebaseTarget(Repo()), "bbbbbbb");
    data.Write("rebase-merge/onto", kA + "\n");
    EXPECT_EQ(RebaseTarget(Repo()), "aaaaaaa");
    const std::string entry = kA + " " + kB + " A <a> 1 +0000\trebase (start): checkout ";
    data.Write("logs/HEAD",
               entry + "old\n" + entry + "origin/main\n" + kA + " " + kB + " A <a> 1 +0000\tcommit: x\n");
    EXPECT_EQ(RebaseTarget(Repo()), "origin/main");
    data.Write("logs/HEAD", entry + kB + "\n");
    EXPECT_EQ(RebaseTarget(Repo()), "bbbbbbb");
}

TEST_F(GitFilesTest, CommitAtHandIsTheLastThatARebaseBegan) {
    EXPECT_EQ(CommitAtHand(Repo()), "");
    EXPECT_EQ(AtHand("REBASE_HEAD", kA + "\n"), "aaaaaaa");
    for (const auto& [line, told] : {std::pair{"pick " + kB + " Dim the light", "bbbbbbb (Dim the light)"},
                                     {"merge -C " + kB + " topic # Merge it", "bbbbbbb (topic # Merge it)"},
                                     {"pick " + kB + " # Dim it", "bbbbbbb (Dim it)"},
                                     {"fixup -c " + kB, "bbbbbbb"},
                                     {"edit bbbbbbb", "bbbbbbb"},
                                     {"exec make", ""},
                                     {"label onto", ""},
                                     {"break", ""}})
        EXPECT_EQ(AtHand("rebase-merge/done", "pick " + kA + " First\n" + line + "\n\n"), told) << line;
}

TEST_F(GitFilesTest, CommitAtHandOfSeveralPicksIsTheFirstThatIsLeft) {
    EXPECT_EQ(AtHand("sequencer/todo", "pick " + kA + " One\npick " + kB + " Two\n"), "aaaaaaa (One)");
    EXPECT_EQ(AtHand("sequencer/todo", "revert aaaaaaa1 One\n"), "aaaaaaa (One)");
}

/// The files say what git itself says of the same repository.
struct GitFilesOfGitTest : GitFolder {
    void CheckHead() const {
        const GitHead head = ReadGitHead(Found());
        EXPECT_EQ(head.commit, Git({"rev-parse", "HEAD"}));
        EXPECT_EQ(head.branch,
                  RunProcess({"git", "branch", "--show-current"}).output.substr(0, head.branch.size()));
    }
};

TEST_F(GitFilesOfGitTest, HeadIsThatOfGitInEveryForm) {
    Commit({{"a", "1"}});
    CheckHead();
    Git({"pack-refs", "--all"});
    CheckHead();
    Git({"checkout", "-q", "-b", "a/b"});
    CheckHead();
    Git({"checkout", "-q", "--detach"});
    CheckHead();
    Git({"worktree", "add", "-q", "-b", "other", "tree"});
    const surroundings::Here tree("tree");
    CheckHead();
    EXPECT_EQ(ReadGitHead(Found()).branch, "other");
}

} // namespace
