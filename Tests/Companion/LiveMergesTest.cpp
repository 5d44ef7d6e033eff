#include "Conflicts/LiveMerges.h"

#include "Conflicts/IndexMerges.h"
#include "Conflicts/OpenMerges.h"
#include "ErrorOf.h"
#include "Support/GitFolder.h"
#include "Words/Failure.h"

namespace {

using namespace ovrin;
using failures::ErrorOf;

/// Branches "main", which is checked out, and "topic" changed a.ovrin and b.ovrin.
struct LiveMergesTest : GitFolder {
    LiveMergesTest() {
        const std::string base = Commit({{"a.ovrin", "base"}, {"b.ovrin", "base"}, {"other.txt", "base"}});
        CommitOn("topic", base, {{"a.ovrin", "theirs"}, {"b.ovrin", "theirs"}, {"other.txt", "theirs"}});
        Git({"checkout", "-q", "main"});
        Commit({{"a.ovrin", "ours"}, {"b.ovrin", "ours"}, {"other.txt", "ours"}});
    }

    static void Run(const CommandWords& words) { EXPECT_NE(RunProcess(words).status, 0); }
    OpenMerge Record(const std::string& path, const std::string& action) {
        OpenMerge merge;
        merge.path = path;
        merge.occasion = {action, "", "main", "topic", Git({"rev-parse", "HEAD"})};
        merge.texts = {"base", "ours", "theirs"};
        OpenMerges(Found()).Add(merge);
        return merge;
    }
    /// "live: a; stale: b; unrecorded: c".
    std::string Seen() const {
        const OpenMerges store(Found());
        const LiveMerges merges = FindLiveMerges(Found(), store);
        std::string seen = "live:";
        for (const OpenMerge& merge : merges.live) seen += " " + merge.path;
        seen += "; stale:";
        for (const OpenMerge& merge : merges.stale) seen += " " + merge.path;
        seen += "; unrecorded:";
        for (const std::string& path : merges.unrecorded) seen += " " + path;
        return seen;
    }
};

TEST_F(LiveMergesTest, MergeIsLiveUntilItIsConcluded) {
    EXPECT_EQ(Seen(), "live:; stale:; unrecorded:");
    Run({"git", "merge", "topic"});
    EXPECT_EQ(Seen(), "live:; stale:; unrecorded: a.ovrin b.ovrin");
    Record("a.ovrin", "merge");
    EXPECT_EQ(Seen(), "live: a.ovrin; stale:; unrecorded: b.ovrin");
    Git({"add", "a.ovrin"});
    EXPECT_EQ(Seen(), "live: a.ovrin; stale:; unrecorded: b.ovrin");
    Git({"add", "."});
    Git({"commit", "-q", "-m", "merged"});
    EXPECT_EQ(Seen(), "live:; stale: a.ovrin; unrecorded:");
}

TEST_F(LiveMergesTest, MergeThatIsGivenUpIsStale) {
    Run({"git", "merge", "topic"});
    Record("a.ovrin", "merge");
    Git({"merge", "--abort"});
    EXPECT_EQ(Seen(), "live:; stale: a.ovrin; unrecorded:");
}

TEST_F(LiveMergesTest, StashIsOverWhenItsFileIsAsInTheLastCommit) {
    folder.Write("a.ovrin", "changed");
    Record("a.ovrin", "stash");
    EXPECT_EQ(Seen(), "live: a.ovrin; stale:; unrecorded:");
    Commit({{"b.ovrin", "elsewhere"}}); // takes a.ovrin along
    EXPECT_EQ(Seen(), "live:; stale: a.ovrin; unrecorded:");
}

TEST_F(LiveMergesTest, CommitOfOtherFilesLeavesAStashOpen) {
    folder.Write("a.ovrin", "changed");
    Record("a.ovrin", "stash");
    Git({"commit", "-q", "--allow-empty", "-m", "other"});
    EXPECT_EQ(Seen(), "live: a.ovrin; stale:; unrecorded:");
}

TEST_F(LiveMergesTest, RebaseThatWentOnHasLeftItsMergeBehind) {
    Git({"checkout", "-q", "topic"});
    Commit({{"b.ovrin", "again"}});
    Run({"git", "rebase", "main"});
    OpenMerge merge = Record("a.ovrin", "rebase");
    merge.occasion.theirs = Git({"rev-parse", "--short", "REBASE_HEAD"}) + " (change)";
    OpenMerges(Found()).Add(merge);
    EXPECT_EQ(Seen(), "live: a.ovrin; stale:; unrecorded: b.ovrin");
    Run({"git", "rebase", "--skip"});
    EXPECT_EQ(Seen(), "live:; stale: a.ovrin; unrecorded: b.ovrin");
}

TEST_F(LiveMergesTest, IndexHasTheMergeOfAScene) {
    Run({"git", "merge", "topic"});
    const Repository repository = Found();
    IndexMerges index(repository);
    const OpenMerge merge = index.Read("a.ovrin");
    EXPECT_EQ(merge.texts.base + "," + merge.texts.ours + "," + merge.texts.theirs, "base,ours,theirs");
    EXPECT_EQ(merge.occasion.action + " " + merge.occasion.ours + " " + merge.occasion.theirs,
              "merge main topic");
    EXPECT_EQ(merge.occasion.head, Git({"rev-parse", "HEAD"}));
    EXPECT_FALSE(merge.isBothAdded);
}

TEST_F(LiveMergesTest, IndexConfirmsTextsOfAllSides) {
    Run({"git", "merge", "topic"});
    const Repository repository = Found();
    IndexMerges index(repository);
    const OpenMerge merge = index.Read("a.ovrin");
    EXPECT_TRUE(index.Confirm(merge));
    for (std::string ThreeTexts::*text : {&ThreeTexts::base, &ThreeTexts::ours, &ThreeTexts::theirs}) {
        OpenMerge changed = merge;
        (changed.texts.*text) += "x";
        EXPECT_FALSE(index.Confirm(changed));
    }
    OpenMerge settled = merge;
    settled.path = "not unmerged";
    EXPECT_TRUE(index.Confirm(settled));
}

TEST_F(LiveMergesTest, SideThatRemovedASceneIsTold) {
    std::filesystem::remove("a.ovrin");
    Commit({});
    Run({"git", "merge", "topic"});
    const Repository repository = Found();
    const auto read = [&](const std::string& path) {
        return ErrorOf<Failure>([&] { IndexMerges(repository).Read(path); });
    };
    EXPECT_TRUE(read("a.ovrin").starts_with("ours has removed it")) << read("a.ovrin");
    EXPECT_TRUE(read("no.ovrin").starts_with("nothing is written down of its merge")) << read("no.ovrin");
}

TEST_F(LiveMergesTest, SceneOfBothSidesHasNoBase) {
    Git({"checkout", "-q", "topic"});
    Commit({{"new.ovrin", "theirs"}});
    Git({"checkout", "-q", "main"});
    Commit({{"new.ovrin", "ours"}});
    Run({"git", "merge", "topic"});
    const Repository repository = Found();
    EXPECT_TRUE(IndexMerges(repository).Read("new.ovrin").isBothAdded);
}

TEST_F(LiveMergesTest, OtherSystemsSayWhatIsUnmerged) {
    surroundings::FakePrograms programs;
    const program::WorkingDirectory data;
    const Repository copy = {SystemKind::Subversion, folder.Path(), data.Path()};
    OpenMerges store(copy);
    OpenMerge merge;
    for (const char* path : {"a.ovrin", "over.ovrin"}) {
        merge.path = path;
        store.Add(merge);
    }
    programs.Say("svn", "status", "C       a.ovrin\nC       b.ovrin\nC       text.txt\n");
    const LiveMerges merges = FindLiveMerges(copy, store);
    EXPECT_EQ(merges.live.at(0).path, "a.ovrin");
    EXPECT_EQ(merges.stale.at(0).path, "over.ovrin");
    EXPECT_EQ(merges.unrecorded, std::vector<std::string>{"b.ovrin"});
}

} // namespace
