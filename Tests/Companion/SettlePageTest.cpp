#include "Settle/Web/SettlePage.h"

#include "Names/PrintableText.h"
#include "PageScene.h"

#include <filesystem>
#include <gtest/gtest.h>

namespace {

using namespace open_scenes;

struct SettlePageTest : PageScene {};

/// A lantern whose layer all three have another of.
ThreeTexts Layers(const std::string& base, const std::string& ours, const std::string& theirs,
                  const std::string& name = "Lantern") {
    const auto scene = [&](const std::string& layer) { return kHeader + Object(10, layer, name); };
    return {scene(base), scene(ours), scene(theirs)};
}

/// Theirs removes the buoy, which the lamp of ours leads to.
ThreeTexts LampWithoutBuoy() {
    const std::string buoy = Object(10, "1", "Buoy");
    return {kHeader + buoy + Object(40, "0", "Lamp"), kHeader + buoy + Object(40, "{fileID: 10}", "Lamp"),
            kHeader + Object(40, "0", "Lamp")};
}

TEST_F(SettlePageTest, StepOfWhoHasSeenAnotherStateDecidesNothing) {
    Serve({{"a.ovrin", TwoConflicts()}});
    const std::uint64_t seen = Get("session")["revision"];
    Take(0, "theirs");
    const json now = Get("session");
    const std::pair<const char*, json> steps[] = {{"take", {{"item", 0}, {"side", "ours"}}},
                                                  {"take", {{"under", 0}, {"side", "ours"}}},
                                                  {"take", {{"all", true}, {"side", "ours"}}},
                                                  {"take", {{"proposed", true}}},
                                                  {"take", {{"problem", 0}, {"remedy", 0}}},
                                                  {"undo", json::object()},
                                                  {"redo", json::object()},
                                                  {"finish", {{"overwrite", true}}}};
    for (auto [name, body] : steps)
        for (const std::uint64_t revision : {seen, std::uint64_t{0}, seen + 2, ~std::uint64_t{0}}) {
            body["revision"] = revision;
            Post(name, body, 409);
        }
    EXPECT_EQ(Get("session"), now);
}

TEST_F(SettlePageTest, StepThatIsSentTwiceIsMadeOnce) {
    Serve({{"a.ovrin", TwoConflicts()}});
    const json before = State(), body = {{"item", 0}, {"side", "base"}, {"revision", 1}};
    Post("take", body);
    Post("take", body, 409);
    EXPECT_EQ(Step("undo")["session"]["open"], 2);
    EXPECT_EQ(State(), before);
}

TEST_F(SettlePageTest, StepThatDecidesNothingIsNotTakenBack) {
    Serve({{"a.ovrin", TwoConflicts()}});
    const json before = State();
    Take(0, "base");
    for (int i = 0; i < 3; ++i) EXPECT_EQ(Step("take", {{"under", 0}, {"side", "ours"}})["settled"], 0);
    Step("take", {{"proposed", true}});
    Step("undo");
    EXPECT_EQ(State(), before);
}

TEST_F(SettlePageTest, NothingLiesAheadOfTheFirstStepNorBehindTheLast) {
    Serve({{"a.ovrin", TwoConflicts()}});
    const json begun = Get("session");
    for (const char* name : {"undo", "redo"}) Step(name, {}, 400);
    EXPECT_EQ(Get("session"), begun);
    Take(0, "theirs");
    Take(1, "base");
    const json settled = State();
    Step("undo");
    Step("undo");
    Step("undo", {}, 400);
    Step("redo");
    Step("redo");
    EXPECT_EQ(State(), settled);
    Step("redo", {}, 400);
    Step("undo");
    Take(1, "theirs");
    EXPECT_FALSE(Get("session")["canRedo"]);
    Step("redo", {}, 400);
}

TEST_F(SettlePageTest, WhatIsNotThereIsToldAndDecidesNothing) {
    Serve({{"a.ovrin", LampWithoutBuoy()}, {"b.ovrin", Layers("1", "2", "3")}});
    const json begun = Get("session");
    ASSERT_EQ(begun["problems"].size(), 1);
    const std::uint64_t none = ~std::uint64_t{0};
    for (const json& body :
         {json{{"item", 1}, {"side", "ours"}}, json{{"item", none}, {"side", "ours"}},
          json{{"under", 1}, {"side", "ours"}}, json{{"under", none}, {"side", "ours"}},
          json{{"problem", 1}, {"remedy", 0}}, json{{"problem", none}, {"remedy", 0}},
          json{{"problem", 0}, {"remedy", begun["problems"][0]["remedies"].size()}},
          json{{"problem", 0}, {"remedy", none}}, json{{"item", 0}, {"side", "Theirs"}}, json::object()})
        Step("take", body, 400);
    EXPECT_EQ(Get("session"), begun);
}

TEST_F(SettlePageTest, RemedyMendsItsProblemAndNoOther) {
    Serve({{"a.ovrin", LampWithoutBuoy()}, {"b.ovrin", LampWithoutBuoy()}});
    ASSERT_EQ(Get("session")["problems"].size(), 2);
    const json session = Step("take", {{"problem", 1}, {"remedy", 0}})["session"];
    ASSERT_EQ(session["problems"].size(), 1);
    EXPECT_EQ(session["problems"][0]["scene"], 0);
    Step("take", {{"problem", 1}, {"remedy", 0}}, 400);
    EXPECT_EQ(Step("undo")["session"]["problems"].size(), 2);
}

TEST_F(SettlePageTest, OnlyWhatIsSettledIsWritten) {
    Serve({{"a.ovrin", TwoConflicts()}, {"b.ovrin", Layers("1", "2", "3")}});
    EXPECT_NE(std::string(Finish(true, 400)["error"]).find("3 open conflicts"), std::string::npos);
    Take(2, "theirs");
    const json answer = Finish(false);
    EXPECT_EQ(answer["finished"], json::array({"b.ovrin"}));
    EXPECT_EQ(answer["isOver"], false);
    EXPECT_EQ(folder.Read("a.ovrin"), TwoConflicts().ours);
    EXPECT_EQ(folder.Read("b.ovrin"), Layers("1", "2", "3").theirs);
    EXPECT_EQ(Unmerged(), "a.ovrin");
    const json left = Get("session");
    EXPECT_EQ(left["scenes"][1]["isFinished"], true);
    EXPECT_FALSE(left["canUndo"]);
    Take(2, "ours", 400);
    Step("take", {{"under", 2}, {"side", "ours"}}, 400);
    Step("undo", {}, 400);
    Finish(true, 400);
    EXPECT_EQ(Get("session")["open"], 2);
    TakeAll("theirs");
    EXPECT_EQ(Finish(false)["finished"], json::array({"a.ovrin"}));
    EXPECT_EQ(folder.Read("a.ovrin"), TwoConflicts().theirs);
    EXPECT_EQ(Unmerged(), "");
}

TEST_F(SettlePageTest, LastAnswerIsThatOfTheLastSceneOrOfLeaving) {
    Serve({{"a.ovrin", Layers("1", "2", "3")}});
    TakeAll("base");
    const std::uint64_t revision = Get("session")["revision"];
    EXPECT_FALSE(Ask({"POST", "api/leave", {}, R"({"revision":1})"}).isOver); // which isn't known there
    EXPECT_TRUE(Ask({"POST", "api/leave", {}, "{}"}).isOver);
    EXPECT_EQ(folder.Read("a.ovrin"), Layers("1", "2", "3").ours);
    const json finish = {{"overwrite", false}, {"revision", revision}};
    EXPECT_TRUE(Ask({"POST", "api/finish", {}, finish.dump()}).isOver);
    EXPECT_EQ(page->Finished(), std::vector<std::string>{"a.ovrin"});
}

TEST_F(SettlePageTest, FinishThatFailsHalfwayIsCompletedByTheNext) {
    const ThreeTexts texts = Layers("1", "2", "3");
    Serve({{"a.ovrin", texts}, {"b.ovrin", texts}});
    TakeAll("theirs");
    std::filesystem::remove("b.ovrin");
    folder.Write("b.ovrin/in the way", "");
    Finish(true, 400);
    EXPECT_EQ(Unmerged(), "a.ovrin\nb.ovrin");
    EXPECT_TRUE(page->Finished().empty());
    std::filesystem::remove_all("b.ovrin");
    folder.Write("b.ovrin", texts.ours);
    EXPECT_EQ(Finish(false)["isOver"], true);
    EXPECT_EQ(folder.Read("b.ovrin"), texts.theirs);
    EXPECT_EQ(Unmerged(), "");
}

TEST_F(SettlePageTest, SceneWhoseFileOrMergeIsGoneIsToldOf) {
    const ThreeTexts texts = Layers("1", "2", "3");
    Serve({{"a.ovrin", texts}, {"b.ovrin", texts}});
    TakeAll("theirs");
    std::filesystem::remove("a.ovrin");
    Git({"update-index", "--force-remove", "b.ovrin"}); // the merge is given up
    const json answer = Finish(false);
    EXPECT_TRUE(answer["finished"].empty());
    ASSERT_EQ(answer["remarks"].size(), 2);
    EXPECT_NE(std::string(answer["remarks"][0]).find("a.ovrin was changed by hand"), std::string::npos);
    EXPECT_EQ(folder.Read("a.ovrin"), "<missing>");
    EXPECT_EQ(folder.Read("b.ovrin"), texts.ours);
    EXPECT_EQ(Finish(true)["finished"], json::array({"a.ovrin"}));
    EXPECT_EQ(folder.Read("b.ovrin"), texts.ours);
}

TEST_F(SettlePageTest, WhatAnotherProgramDecidedMeanwhileStays) {
    Serve({{"a.ovrin", TwoConflicts()}});
    const json begun = State();
    {
        SettleScenes others(remarks);
        others.Open(remarks);
        SettleDesk(others).Take(0, Side::Base);
    }
    for (const json& body : {json{{"item", 0}, {"side", "ours"}}, json{{"under", 1}, {"side", "ours"}},
                             json{{"all", true}, {"side", "ours"}}})
        Step("take", body, 400);
    EXPECT_EQ(State(), begun);
    Open();
    EXPECT_EQ(Get("conflicts")["items"][0]["decided"], "base");
}

TEST_F(SettlePageTest, WhatBothAddedIsLookedThroughFirst) {
    const std::string scene = kHeader + Object(10, "1", "Lantern");
    Serve({{"a.ovrin", {"", scene, scene}}});
    const json session = Get("session");
    EXPECT_EQ(session["scenes"][0]["bothAdded"], true);
    EXPECT_EQ(session["isSettled"], false);
    EXPECT_NE(std::string(Finish(true, 400)["error"]).find("both sides added"), std::string::npos);
    TakeAll("ours");
    EXPECT_EQ(Finish(false)["isOver"], true);
}

TEST_F(SettlePageTest, LongListComesInPieces) {
    const auto scene = [](int layer) {
        std::string text = kHeader;
        for (int id = 1; id <= 1234; ++id) text += Object(id, std::to_string(layer), "Buoy");
        return text;
    };
    Serve({{"a.ovrin", {scene(1), scene(2), scene(3)}}});
    EXPECT_EQ(Get("conflicts")["items"].size(), 200);
    json together = json::array();
    for (const char* from : {"0", "1000"}) {
        const json page = Get("conflicts", {{"from", from}, {"count", "99999999"}});
        together.insert(together.end(), page["items"].begin(), page["items"].end());
    }
    ASSERT_EQ(together.size(), 1234);
    for (std::size_t i = 0; i < together.size(); ++i) ASSERT_EQ(together[i]["index"], i);
    const json part = Get("conflicts", {{"from", "1230"}, {"count", "2"}});
    EXPECT_EQ(part["total"], 1234);
    EXPECT_EQ(part["items"], json::array({together[1230], together[1231]}));
    for (const char* from : {"1234", "1235", "18446744073709551615"})
        EXPECT_EQ(Get("conflicts", {{"from", from}})["items"], json::array());
    for (const char* number : {"-1", "+1", " 1", "1 ", "0x1", "1e2", "18446744073709551616", "one"})
        for (const char* key : {"from", "count"}) Get("conflicts", {{key, number}}, 400);
}

/// All texts in a value, keys too.
void AddTexts(const json& value, std::vector<std::string>& texts) {
    if (value.is_string()) texts.push_back(value);
    for (const auto& [key, inner] : value.items())
        if (value.is_structured()) AddTexts(inner, texts);
}

TEST_F(SettlePageTest, TextsOfScenesAreFitToBeShown) {
    const std::string name = R"("</script>\" ' \e[31m \u202E \a \u2028 \uFEFF")",
                      odd = "\u202E\x01\xFF<&>.ovrin";
    Serve(
        {{"a.ovrin", Layers(R"("\b1")", R"("\u20662")", R"("\x7F3")", name)}, {odd, Layers("1", "2", "3")}});
    const std::vector<SettlePage::Unreadable> unreadable = {{odd, "line\x1b[2J\xC3 of \u202E" + odd}};
    SettlePage all(*scenes, *desk, unreadable);
    std::vector<std::string> texts;
    for (const char* path :
         {"api/session", "api/conflicts", "api/tree", "api/find", "api/object", "api/map"}) {
        const PageAnswer answer = all.Answer({"GET", path, {{"text", "script"}, {"id", "10"}}, ""});
        AddTexts(json::parse(answer.body), texts);
        EXPECT_EQ(answer.status, 200) << path;
    }
    EXPECT_GT(texts.size(), 50);
    for (const std::string& text : texts) EXPECT_EQ(PrintableLines(text), text);
}

} // namespace
