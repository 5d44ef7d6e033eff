#include "Settle/SettleScenes.h"

#include "ErrorOf.h"
#include "OpenScenes.h"
#include "Words/Failure.h"

#include <filesystem>
#include <gtest/gtest.h>

namespace {

using namespace open_scenes;
using failures::ErrorOf;
namespace fs = std::filesystem;
using Paths = std::vector<std::string>;

const ThreeTexts kTexts = TwoConflicts();

struct SettleScenesTest : UnmergedFolder {
    SettleScenes& Open(const Paths& places = {}) {
        remarks.clear();
        scenes.emplace(remarks);
        scenes->LimitTo(places);
        scenes->Open(remarks);
        return *scenes;
    }
    /// Opens all and takes a side everywhere, and writes that down.
    SettleScenes& Settled(Side side = Side::Theirs) {
        Open();
        for (const auto& session : scenes->Sessions()) {
            session->TakeAll(side, [](const OpenConflict&) { return true; });
            scenes->Keep(*session);
        }
        return *scenes;
    }
    std::string Records() const { return (folder.Path() / ".git/ovrin").string(); }
    std::string AllRemarks() const {
        std::string all;
        for (const std::string& remark : remarks) all += remark + "\n";
        return all;
    }

    Remarks remarks;
    std::optional<SettleScenes> scenes;
};

TEST_F(SettleScenesTest, AreLimitedToFilesAndFoldersAsTheUserTypesThem) {
    for (const char* name : {"a/x.ovrin", "a/y.ovrin", "ab.ovrin"}) Record(name, kTexts);
    Unmerge("a/b/z.ovrin", kTexts);
    const auto limited = [&](const Paths& places) {
        SettleScenes all(remarks);
        all.LimitTo(places);
        return all.Paths();
    };
    const Paths inA = {"a/b/z.ovrin", "a/x.ovrin", "a/y.ovrin"};
    EXPECT_EQ(limited({"a"}), inA);
    EXPECT_EQ(limited({"a/", "a/x.ovrin"}), inA);
    EXPECT_EQ(limited({"./a/../ab.ovrin"}), Paths{"ab.ovrin"});
    EXPECT_EQ(limited({(folder.Path() / "a/b").string()}), Paths{"a/b/z.ovrin"});
    const surroundings::Here inside(folder.Path() / "a");
    EXPECT_EQ(limited({"."}), inA);
    for (const char* nothing : {"c", "x", "", "../a/x.ovri", "/"})
        EXPECT_THROW(limited({".", nothing}), Failure) << nothing;
}

TEST_F(SettleScenesTest, AreCountedWithAndWithoutARecord) {
    Record("b.ovrin", kTexts);
    Unmerge("a.ovrin", kTexts);
    Unmerge("c.ovrin", {kTexts.base, kHeader + "--- !o!1 &1\nA: [\n", kTexts.theirs});
    Open({"b.ovrin"}).Sessions()[0]->Decide({{"20", Side::Ours}});
    scenes->Keep(*scenes->Sessions()[0]);
    const std::vector<SceneCount> counts = SettleScenes(remarks).Count();
    ASSERT_EQ(counts.size(), 3);
    EXPECT_EQ(TellCount(counts[0]).substr(0, 25), "a.ovrin: 2 open conflicts");
    EXPECT_EQ(TellCount(counts[1]),
              "b.ovrin: 1 open conflict, 1 settled (merge, ours is main, theirs is topic)");
    EXPECT_NE(counts[2].problem, "");
    EXPECT_EQ(Open().Unreadable().size(), 1);
    EXPECT_EQ(scenes->Sessions().size(), 2);
}

TEST_F(SettleScenesTest, FinishThatFailedMidwayIsCompletedByTheNext) {
    Record("a.ovrin", kTexts);
    Record("b/b.ovrin", kTexts);
    Settled();
    fs::remove_all("b");
    EXPECT_NE(ErrorOf<Failure>([&] { scenes->Finish(true, remarks); }).find("b/b.ovrin"), std::string::npos);
    EXPECT_EQ(Unmerged(), "a.ovrin\nb/b.ovrin");
    fs::create_directory("b");
    EXPECT_EQ(scenes->Finish(true, remarks), (Paths{"a.ovrin", "b/b.ovrin"}));
    EXPECT_EQ(folder.Read("a.ovrin"), kTexts.theirs);
    EXPECT_EQ(folder.Read("b/b.ovrin"), kTexts.theirs);
    EXPECT_EQ(Unmerged(), "");
    EXPECT_EQ(OpenMerges(Found()).List().size(), 0);
}

TEST_F(SettleScenesTest, OneThatIsRefusedHoldsUpNoOther) {
    for (const char* name : {"a.ovrin", "b.ovrin", "c.ovrin"}) Record(name, kTexts);
    Settled();
    folder.Write("a.ovrin", "by hand\n");
    fs::remove("b.ovrin");
    EXPECT_EQ(scenes->Finish(false, remarks), Paths{"c.ovrin"});
    EXPECT_EQ(remarks.size(), 2) << AllRemarks();
    EXPECT_EQ(folder.Read("a.ovrin"), "by hand\n");
    EXPECT_FALSE(fs::exists("b.ovrin"));
    remarks.clear();
    EXPECT_EQ(scenes->Finish(true, remarks), (Paths{"a.ovrin", "b.ovrin"})) << AllRemarks();
    EXPECT_TRUE(scenes->Finish(true, remarks).empty() && remarks.empty());
}

TEST_F(SettleScenesTest, LineEndsThatGitConvertsAreNoChangeByHand) {
    Record("a.ovrin", kTexts);
    Git({"config", "core.autocrlf", "true"});
    std::string converted;
    for (const char letter : kTexts.ours) converted += letter == '\n' ? "\r\n" : std::string(1, letter);
    folder.Write("a.ovrin", converted);
    EXPECT_EQ(Settled().Finish(false, remarks), Paths{"a.ovrin"}) << AllRemarks();
}

TEST_F(SettleScenesTest, AreTakenAsTheyStandTogetherOrNotAtAll) {
    Record("a.ovrin", kTexts);
    Record("b.ovrin", kTexts);
    for (const char* text : {"<<<<<<< ours\n=======\n>>>>>>> theirs\n", ""}) {
        folder.Write("b.ovrin", std::string(text) + kTexts.ours);
        if (!*text) fs::remove("b.ovrin");
        EXPECT_THROW(SettleScenes(remarks).TakeAsTheyStand(), Failure);
        EXPECT_EQ(Unmerged(), "a.ovrin\nb.ovrin");
    }
    fs::create_symlink("a.ovrin", "b.ovrin");
    EXPECT_THROW(SettleScenes(remarks).TakeAsTheyStand(), Failure);
    EXPECT_EQ(OpenMerges(Found()).List().size(), 2);
    fs::remove("b.ovrin");
    folder.Write("b.ovrin", "whatever it is\n");
    SettleScenes(remarks).TakeAsTheyStand();
    EXPECT_EQ(Unmerged(), "");
    EXPECT_EQ(Git({"show", ":b.ovrin"}), "whatever it is");
}

TEST_F(SettleScenesTest, ForgettingTouchesNothingElse) {
    Record("a.ovrin", kTexts);
    Settled();
    SettleScenes(remarks).Forget();
    EXPECT_FALSE(fs::exists(Records()));
    EXPECT_EQ(Unmerged(), "a.ovrin");
    EXPECT_EQ(folder.Read("a.ovrin"), kTexts.ours);
    EXPECT_EQ(Open().Sessions()[0]->Open().size(), 2); // from the index, anew
}

TEST_F(SettleScenesTest, BrokenRecordIsToldWithTheWayOutAndHoldsUpNoOther) {
    Record("a.ovrin", kTexts);
    for (const fs::path& file : fs::directory_iterator(Records())) {
        fs::resize_file(file, fs::file_size(file) - 1);
        Record("b.ovrin", kTexts);
        Open();
        EXPECT_EQ(scenes->Unreadable().size(), 1);
        EXPECT_EQ(scenes->Sessions().size(), 1);
        EXPECT_NE(AllRemarks().find("Remove that file"), std::string::npos) << AllRemarks();
        fs::remove(file);
        break;
    }
    EXPECT_EQ(Open().Sessions().size(), 2) << AllRemarks();
}

TEST_F(SettleScenesTest, ProposalsThatCannotBeReadOrKeptHoldUpNothing) {
    Record("a.ovrin", kTexts);
    fs::create_directories(Records() + "/decisions/in the way");
    Settled();
    EXPECT_NE(AllRemarks().find("can't be proposed"), std::string::npos);
    remarks.clear();
    EXPECT_EQ(scenes->Finish(false, remarks), Paths{"a.ovrin"});
    EXPECT_EQ(remarks.size(), 1) << AllRemarks();
    EXPECT_EQ(Unmerged(), "");
}

TEST_F(SettleScenesTest, DecisionsOfWhatIsOverAreProposedInTheNext) {
    Record("a.ovrin", kTexts);
    Settled();
    Git({"read-tree", "--empty"}); // given up
    Open();
    EXPECT_NE(AllRemarks().find("a.ovrin is forgotten"), std::string::npos);
    EXPECT_EQ(OpenMerges(Found()).List().size(), 0);
    Unmerge("elsewhere.ovrin", kTexts);
    EXPECT_EQ(Open().Sessions().at(0)->CountProposed(), 2);
    EXPECT_EQ(RememberDecisions(Found(), "a.ovrin"), 0);
}

TEST_F(SettleScenesTest, FilesElsewhereAreNobodysRecords) {
    Record("a.ovrin", kTexts);
    const program::WorkingDirectory outside;
    outside.Write("a.ovrin", "");
    for (const std::string& given : {(outside.Path() / "a.ovrin").string(), std::string("b.ovrin"),
                                     std::string("/nowhere/a.ovrin"), std::string("")})
        ForgetSettledFile(given);
    EXPECT_TRUE(OpenMerges(Found()).Has("a.ovrin"));
    ForgetSettledFile((folder.Path() / "a.ovrin").string());
    EXPECT_FALSE(OpenMerges(Found()).Has("a.ovrin"));
    const surroundings::Here there(outside.Path());
    ForgetSettledFile("a.ovrin");
    EXPECT_THROW(SettleScenes none(remarks), Failure);
}

} // namespace
