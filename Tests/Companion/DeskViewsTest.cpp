#include "Settle/Web/DeskViews.h"

#include "PageScene.h"

#include <csignal>
#include <gtest/gtest.h>

namespace {

using namespace open_scenes;

/// The buoy, 20, is removed by theirs and changed by ours, and the lantern, 10, changed by both.
struct DeskViewsTest : PageScene {
    DeskViewsTest() { Serve({{"a.ovrin", TwoConflicts()}}); }
    /// What the result has for the layer of an object, as a page shows it; "-" for nothing.
    std::string Result(const std::string& id) {
        const json object = Get("object", {{"id", id}, {"all", "1"}});
        for (const json& row : object["rows"])
            if (row["property"] == "m_Layer") {
                const json& value = row["values"]["result"];
                return value.is_null() ? "-" : std::string(value["text"]);
            }
        return "no layer";
    }
};

TEST_F(DeskViewsTest, ObjectThatADecisionRemovesComesBackWithIt) {
    const json begun = Get("object", {{"id", "20"}});
    EXPECT_EQ(Result("20"), "7");
    for (const auto& [side, result] : {std::pair("theirs", "-"), {"base", "1"}, {"ours", "7"}}) {
        Take(1, side);
        EXPECT_EQ(Result("20"), result);
        EXPECT_EQ(Result("10"), "5");
    }
    for (int i = 0; i < 3; ++i) Step("undo");
    EXPECT_EQ(Get("object", {{"id", "20"}}), begun);
}

TEST_F(DeskViewsTest, TreeCountsWhatIsOpenNow) {
    const auto open = [&] {
        std::size_t count = 0;
        const json tree = Get("tree");
        for (const json& node : tree["nodes"]) count += std::size_t{node["open"]};
        return count;
    };
    EXPECT_EQ(open(), 2);
    Take(0, "base");
    EXPECT_EQ(open(), 1);
    TakeAll("theirs");
    EXPECT_EQ(open(), 0);
    Step("undo");
    EXPECT_EQ(open(), 1);
}

TEST_F(DeskViewsTest, EndOfTheProcessThatMergedCostsOneAnswer) {
    Take(1, "theirs");
    EXPECT_EQ(Result("20"), "-");
    pid_t process = 0;
    std::istringstream(program::ReadFile("/proc/thread-self/children")) >> process;
    if (process <= 0) GTEST_SKIP() << "the system doesn't tell of processes";
    kill(process, SIGKILL);
    const json told = Get("object", {{"id", "20"}}, 400);
    EXPECT_NE(std::string(told["error"]).find("ask again"), std::string::npos) << told;
    EXPECT_EQ(Result("20"), "-");
}

TEST_F(DeskViewsTest, EachSceneShowsItsOwn) {
    ThreeTexts others = TwoConflicts();
    others.ours = kHeader + Object(10, "9", "Lantern");
    Serve({{"b.ovrin", others}});
    Step("take", {{"item", 2}, {"side", "theirs"}});
    const auto layer = [&](const char* scene) {
        const json object = Get("object", {{"scene", scene}, {"id", "10"}});
        return object["rows"][0]["values"]["result"]["text"];
    };
    EXPECT_EQ(layer("0"), "5");
    EXPECT_EQ(layer("1"), "2");
    EXPECT_EQ(Get("object", {{"id", "10"}}), Get("object", {{"scene", "0"}, {"id", "10"}}));
}

TEST_F(DeskViewsTest, WhatIsNotThereIsToldByItsStatus) {
    for (const char* path : {"tree", "find", "object", "map"})
        for (const char* scene :
             {"1", "-1", "x", "18446744073709551615", "18446744073709551616", "0x0", " 0"})
            Get(path, {{"scene", scene}}, 400);
    for (const std::string& id :
         {std::string(), std::string("11"), std::string("010"), std::string("10\0", 3), std::string("\xff"),
          std::string(4000, '1'), std::string("10.GameObject")}) {
        Get("object", {{"id", id}}, 404);
        if (!id.empty()) Get("tree", {{"parent", id}}, 404);
    }
    const Query wrong[] = {{{"view", "front"}},
                           {{"cells", "0"}},
                           {{"cells", "-1"}},
                           {{"x0", "1"}},
                           {{"x0", "a"}},
                           {{"x0", "0"}, {"y0", "0"}, {"x1", "1"}},
                           {{"x0", "nan"}, {"y0", "0"}, {"x1", "1"}, {"y1", "1"}},
                           {{"x0", "2"}, {"y0", "0"}, {"x1", "1"}, {"y1", "1"}}};
    for (const Query& query : wrong) Get("map", query, 400);
    for (const char* number : {"-1", "x"}) {
        Get("tree", {{"from", number}}, 400);
        Get("find", {{"text", "a"}, {"count", number}}, 400);
    }
}

TEST_F(DeskViewsTest, NumbersBeyondAllAreAnsweredWithinBounds) {
    const std::string huge = "18446744073709551615";
    EXPECT_EQ(Get("tree", {{"from", huge}, {"count", huge}})["nodes"], json::array());
    EXPECT_EQ(Get("tree", {{"count", huge}})["nodes"].size(), 2);
    EXPECT_EQ(Get("find", {{"text", "\xff\x00"}, {"from", huge}})["total"], 0);
    EXPECT_EQ(Get("find", {{"text", "BUOY"}, {"from", "1"}})["hits"], json::array());
    Get("map", {{"cells", huge}});
    Get("map", {{"x0", "-1e308"}, {"y0", "-1e308"}, {"x1", "1e308"}, {"y1", "1e308"}});
}

} // namespace
