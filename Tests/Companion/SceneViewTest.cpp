#include "Review/SceneView.h"

#include "Review/ViewRequests.h"

#include "ReviewScene.h"

#include <gtest/gtest.h>

namespace {

using namespace review_scene;
using nlohmann::json;
using ovrin_yaml::SequenceType;
using ovrin_yaml::YAMLScalar;

struct SceneViewTest : testing::Test {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }
};

const std::string kHarbour = Place(10, "Harbour", 0, {21, 31});

TEST_F(SceneViewTest, TheTreeHasAllVersionsInTheOrderOfTheHierarchy) {
    const std::string lantern = Place(20, "Lantern", 11), boat = Place(30, "Boat", 11);
    Viewed viewed(kHarbour + lantern + boat,
                  Place(10, "Harbour", 0, {21, 41}) + lantern + Place(40, "Hook", 11),
                  kHarbour + lantern + boat + Object("&90 Material", "m_Name: Rust"));
    EXPECT_EQ(viewed.Tree(), "Harbour same\n"
                             " Transform same\n"
                             " Lantern same\n  Transform same\n"
                             " Hook added by ours\n  Transform added by ours\n"
                             " Boat removed by ours\n  Transform removed by ours\n"
                             "Material Rust added by theirs\n");
    EXPECT_EQ(viewed.view.Counts(), (json{{"added", 3}, {"removed", 2}, {"changed", 0}, {"moved", 0}}));
}

TEST_F(SceneViewTest, MarksTellWhoDidWhat) {
    const auto scene = [](const std::string& name, int father, const std::string& layer) {
        return Place(10, "Harbour", 0, father == 11 ? std::vector<int>{21} : std::vector<int>()) +
               Place(20, name, father, {}, "", "; m_Layer: " + layer);
    };
    Viewed viewed(scene("Lantern", 11, "1"), scene("Lamp", 0, "2"), scene("Lantern", 11, "3"));
    EXPECT_EQ(viewed.Tree(), "Harbour same\n Transform same\nLamp moved by both open 1\n Transform same\n");
    EXPECT_EQ(viewed.view.Counts()["moved"], 1);
    EXPECT_EQ(viewed.view.Counts()["changed"], 1);
    Viewed other(scene("Lantern", 0, "1"), scene("Lantern", 0, "2"), scene("Lantern", 0, "2"));
    EXPECT_EQ(other.Tree(true), "Lantern changed by both\n");
}

TEST_F(SceneViewTest, WhatIsSeenFromFarthestIsTheMark) {
    const auto scene = [](const std::string& boat) { return kHarbour + boat; };
    const std::string here = scene(Place(20, "Boat", 11)), changed = scene(Place(20, "Boot", 11)),
                      moved = scene(Place(20, "Boat")), both = scene(Place(20, "Boot")), gone = scene("");
    const std::tuple<std::string, std::string, std::string, const char*> cases[] = {
        {here, moved, changed, "moved by both"},     {here, gone, changed, "removed by ours"},
        {here, moved, gone, "removed by theirs"},    {here, gone, gone, "removed by both"},
        {gone, here, here, "added by both"},         {gone, here, gone, "added by ours"},
        {here, here, both, "moved by theirs"},       {here, both, here, "moved by ours"},
        {here, changed, changed, "changed by both"}, {here, here, here, "same"}};
    for (const auto& [base, ours, theirs, mark] : cases) {
        Viewed viewed(base, ours, theirs);
        const json page = viewed.view.Object("20", false);
        const std::string by = page["by"].is_null() ? "" : " by " + page["by"].get<std::string>();
        EXPECT_EQ(page["mark"].get<std::string>() + by, mark);
    }
}

TEST_F(SceneViewTest, WhatTheirsAloneRenamedHasItsNewName) {
    Viewed viewed(Place(10, "Pier"), Place(10, "Pier"), Place(10, "Quay"));
    EXPECT_EQ(viewed.Tree(), "Quay changed by theirs\n Transform same\n");
}

TEST_F(SceneViewTest, TheFilterKeepsWhatStandsAboveATouchedObject) {
    const auto scene = [](const std::string& name) {
        return Place(10, "A", 0, {21}) + Place(20, "B", 11, {31}) + Place(30, name, 21) + Place(40, "D");
    };
    Viewed viewed(scene("C"), scene("C1"), scene("C2"));
    EXPECT_EQ(viewed.Tree(true), "A same\n B same\n  C1 changed by both open 1\n");
    const json top = viewed.view.Tree("", {0, 10}, false)["nodes"][0];
    EXPECT_EQ(top["below"], (json{{"changed", 1}, {"open", 1}}));
    EXPECT_EQ(top["children"], 2);
    viewed.view.SetConflicts({});
    EXPECT_EQ(viewed.view.Tree("", {0, 10}, true)["nodes"][0]["below"]["open"], 0);
}

TEST_F(SceneViewTest, PagesAndSearchesTakeAStretch) {
    std::string scene;
    for (int i = 1; i <= 9; ++i) scene += Place(10 * i, "Post " + std::to_string(i));
    Viewed viewed(scene, scene, scene);
    const json page = viewed.view.Tree("", {7, 5}, false);
    EXPECT_EQ(page["total"], 9);
    EXPECT_EQ(page["nodes"].size(), 2);
    EXPECT_EQ(page["nodes"][0]["name"], "Post 8");
    const json hits = viewed.view.Find("pOST 3", {0, 5});
    EXPECT_EQ(hits["hits"],
              (json::array(
                  {{{"id", "30"}, {"name", "Post 3"}, {"way", json::array()}, {"names", json::array()}}})));
    EXPECT_EQ(viewed.view.Find("31", {0, 5})["hits"][0]["way"], json{"30"});
    EXPECT_EQ(viewed.view.Find("31", {0, 5})["hits"][0]["names"], json{"Post 3"});
    EXPECT_EQ(viewed.view.Find("transform", {0, 5})["total"], 9);
    EXPECT_EQ(viewed.view.Find("", {0, 5})["total"], 0);
    EXPECT_TRUE(viewed.view.Tree("77", {0, 5}, false).is_null());
}

TEST_F(SceneViewTest, RowsAreWhatAPersonKnows) {
    const auto scene = [](const std::string& fields) {
        return Place(10, "A", 0, {}, fields) + Place(20, "B");
    };
    Viewed viewed(
        scene("; m_LocalPosition: {x: 1, y: 2, z: 3}; m_Tint: {r: 1, g: 0.5, b: 0, a: 1}; m_N: 1; m_T: one; "
              "m_Next: {fileID: 0}; m_L: [1, 2]; m_Gone: 4"),
        scene(
            "; m_LocalPosition: {x: 1, y: 2.5, z: 3}; m_Tint: {r: 1, g: 0.5, b: 0, a: 1}; m_N: 2; m_T: two; "
            "m_Next: {fileID: 20}; m_L: [1, 2, 3]; m_Gone: 4"),
        scene("; m_LocalPosition: {x: 1, y: 2, z: 3}; m_Tint: {r: 1, g: 0, b: 0, a: 1}; m_N: 3; m_T: one; "
              "m_Next: {fileID: 0}; m_L: [1, 2]"));
    EXPECT_EQ(viewed.Rows("11"),
              "m_LocalPosition vector ours: {x: 1, y: 2, z: 3} | {x: 1, y: 2.5, z: 3} | {x: 1, y: 2, z: 3} | "
              "{x: 1, y: 2.5, z: 3}\n"
              "m_Tint colour theirs: {r: 1, g: 0.5, b: 0, a: 1} | {r: 1, g: 0.5, b: 0, a: 1} | {r: 1, g: 0, "
              "b: 0, a: "
              "1} | {r: 1, g: 0, b: 0, a: 1}\n"
              "m_N number open: 1 | 2 | 3 | 2\n"
              "m_T text ours: one | two | one | two\n"
              "m_Next reference ours: none | → B (20) | none | → B (20)\n"
              "m_L list ours: [1, 2] | [1, 2, 3] | [1, 2] | [1, 2, 3]\n"
              "m_Gone number theirs: 4 | 4 | - | -\n");
    const json rows = viewed.view.Object("11", false)["rows"];
    EXPECT_EQ(rows[0]["values"]["ours"]["numbers"], json({1.0, 2.5, 3.0}));
    EXPECT_EQ(rows[2]["item"], 0);
    EXPECT_EQ(rows[4]["values"]["ours"]["target"], "20");
    EXPECT_FALSE(rows[4]["values"]["base"].contains("target"));
    EXPECT_NE(viewed.Rows("11", true).find("m_GameObject reference same: → A (10) |"), std::string::npos);
}

TEST_F(SceneViewTest, ElementsWithKeysAreRows) {
    ovrin_yaml::MergeRules rules;
    const auto id = [](const char* text) { return YAMLScalar::Lookup(text); };
    rules.AddSequenceUniqueKeys(SequenceType::Set, {id("*"), id("Rack"), id("m_Slots")}, {{id("n")}});
    const auto rack = [](const std::string& slots) { return Object("&10 Rack", "m_Slots:; " + slots); };
    Viewed viewed(rack("- n: left;   v: 1; - n: right;   v: 1"),
                  rack("- n: right;   v: 2; - n: left;   v: 1"),
                  rack("- n: left;   v: 1; - n: right;   v: 3; - n: top;   v: 9"), rules);
    EXPECT_EQ(viewed.Rows("10"), "m_Slots[right].v number open: 1 | 2 | 3 | 2\n"
                                 "m_Slots[top].n text theirs: - | - | top | top\n"
                                 "m_Slots[top].v number theirs: - | - | 9 | 9\n");
}

TEST_F(SceneViewTest, EveryConflictOfAnObjectHasARow) {
    const auto scene = [](const std::string& list, int layer) {
        return Place(10, "A", 0, {}, "; m_L:; " + list, "; m_Layer: " + std::to_string(layer));
    };
    Viewed viewed(scene("- a: 1;   b: 1; - a: 5;   b: 5", 1), scene("- a: 2;   b: 1; - a: 5;   b: 5", 2),
                  scene("- a: 3;   b: 1; - a: 5;   b: 5", 3));
    Viewed removed(Place(10, "A") + Place(20, "B"),
                   Place(10, "A", 0, {}, "", "; m_Layer: 5") + Place(20, "B"), Place(20, "B"));
    for (Viewed* one : {&viewed, &removed}) {
        std::vector<bool> told(one->merge.Open().size());
        ASSERT_FALSE(told.empty());
        for (const char* id : {"10", "11"})
            for (const json rows = one->view.Object(id, false)["rows"]; const json& row : rows)
                if (row["item"].is_number()) told[row["item"]] = true;
        EXPECT_EQ(std::count(told.begin(), told.end(), false), 0) << one->Rows("10") << one->Rows("11");
    }
    EXPECT_TRUE(removed.Rows("10").starts_with(" other open: there | changed m_Layer | removed | there\n"))
        << removed.Rows("10");
}

TEST_F(SceneViewTest, HostileScenesGetBoundedAnswers) {
    std::string base, deep;
    for (int i = 1; i < 600; ++i) deep += Place(10 * i, "D", 10 * i - 9);
    for (int i = 0; i < 3000; ++i) base += "; m_F" + std::to_string(i) + ": 1";
    const std::string loop = Place(10000, "L", 10011) + Place(10010, "Mole", 10001) + Place(10020, "N", 777);
    const std::string huge = "; m_Text: " + std::string(100000, 'x');
    Viewed viewed(deep + loop, deep + loop, deep + loop + Object("&5000000 Big", "m_A: 1" + base + huge));
    const json big = viewed.view.Object("5000000", false);
    EXPECT_EQ(big["rows"].size(), 2000);
    EXPECT_TRUE(big["isShortened"]);
    EXPECT_EQ(viewed.view.Find("5981", {0, 1})["hits"][0]["way"].size(), 256);
    EXPECT_EQ(viewed.view.Find("mole", {0, 5})["hits"][0]["way"], json::array()); // of a loop
    EXPECT_TRUE(viewed.view.Object("10020", true)["rows"].is_array());
    viewed.view.Map({});
}

TEST_F(SceneViewTest, WayIsShortenedWhereSomethingIsLeftOut) {
    std::string deep;
    for (int i = 1; i <= 258; ++i) deep += Place(10 * i, "D" + std::to_string(i), 10 * i - 9);
    Viewed viewed(deep, deep, deep);
    for (const int depth : {255, 256, 257}) {
        const json hit = viewed.view.Find(std::to_string(10 * depth + 10), {0, 1})["hits"][0];
        const json page = viewed.view.Object(std::to_string(10 * depth + 10), false);
        EXPECT_EQ(hit.value("isShortened", false), depth > 256) << depth;
        EXPECT_EQ(page.value("isShortened", false), depth > 256) << depth;
        EXPECT_EQ(hit["way"].size(), std::min(depth, 256));
        EXPECT_EQ(hit["names"].back(), "D" + std::to_string(std::min(depth, 256)));
    }
}

TEST_F(SceneViewTest, RequestsThatMakeNoSenseAreRefused) {
    Viewed viewed(Place(10, "A"), Place(10, "A"), Place(10, "A"));
    const auto status = [&](const std::string& path, const std::map<std::string, std::string>& query) {
        return AnswerView(viewed.view, {"GET", path, query, ""})->status;
    };
    EXPECT_EQ(status("api/tree", {{"from", "1"}, {"count", "999999999"}}), 200);
    EXPECT_EQ(status("api/tree", {{"from", "-1"}}), 400);
    EXPECT_EQ(status("api/tree", {{"parent", "../10"}}), 404);
    EXPECT_EQ(status("api/object", {}), 404);
    EXPECT_EQ(status("api/find", {{"text", "\xff"}}), 200);
    for (const char* box : {"nan", "1e999", "0x1", "5"})
        EXPECT_EQ(status("api/map", {{"x0", box}, {"y0", "0"}, {"x1", "1"}, {"y1", "1"}}), 400) << box;
    EXPECT_EQ(status("api/map", {{"cells", "0"}}), 400);
    EXPECT_EQ(status("api/map", {{"cells", "100000"}, {"view", "side"}}), 200);
    EXPECT_FALSE(AnswerView(viewed.view, {"GET", "api/session", {}, ""}));
}

} // namespace
