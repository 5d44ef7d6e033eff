#include "Review/SceneMap.h"

#include "Reading/ObjectFileReader.h"
#include "ReviewScene.h"

#include <gtest/gtest.h>

#include <cmath>
#include <random>

namespace {

using namespace review_scene;
using nlohmann::json;

struct SceneMapTest : testing::Test {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }
};

std::string At(const std::string& x, const std::string& y, const std::string& z) {
    return "; m_LocalPosition: {x: " + x + ", y: " + y + ", z: " + z + "}";
}

std::string At(double x, double y, double z) {
    return At(std::to_string(x), std::to_string(y), std::to_string(z));
}

/// Positions by name, as "x y z" in hundredths; "-" for none.
std::string PlacesIn(const std::string& objects, const std::vector<const char*>& ids) {
    ovrin_yaml::OvrinObjects file;
    ovrin_yaml::ParseYAMLString(File(objects), file);
    const ObjectNames names(file.GetMapping());
    const WorldPlaces places(names);
    std::string text;
    for (const char* id : ids) {
        const Point* point = places.Find(ovrin_yaml::YAMLScalar::Lookup(id));
        if (!text.empty()) text += ", ";
        if (!point) text += "-";
        const auto round = [](double number) { return std::to_string(std::lround(number * 100)); };
        if (point) text += round(point->x) + " " + round(point->y) + " " + round(point->z);
    }
    return text;
}

const std::string kQuarterOfY = "; m_LocalRotation: {x: 0, y: 0.70710678, z: 0, w: 0.70710678}";
const std::string kQuarterOfX = "; m_LocalRotation: {x: 0.70710678, y: 0, z: 0, w: 0.70710678}";

TEST_F(SceneMapTest, PlacesGoThroughRotationAndScaleOfAllParents) {
    const std::string scene =
        Place(10, "A", 0, {21}, At(10, 0, 0) + kQuarterOfY + "; m_LocalScale: {x: 2, y: 2, z: 3}") +
        Place(20, "B", 11, {31}, At(1, 0, 0) + kQuarterOfX) + Place(30, "C", 21, {}, At(0, 0, 1)) +
        Place(40, "D", 11, {}, At(0, 5, 1));
    // B: (1, 0, 0) times 2, and x turns to -z. C: z turns to -y within B, and then as B.
    EXPECT_EQ(PlacesIn(scene, {"10", "20", "30", "40"}),
              "1000 0 0, 1000 0 -200, 1000 -200 -200, 1300 1000 0");
}

TEST_F(SceneMapTest, WhatIsBrokenHasNoPlaceAndStopsNothing) {
    const std::string scene =
        Place(10, "A", 0, {}, At("nan", "0", "0")) + Place(20, "B", 11, {}, At(1, 1, 1)) +
        Place(30, "C", 41, {}, At(1, 0, 0)) + Place(40, "D", 31, {}, At(2, 0, 0)) +
        Place(50, "E", 31, {}, At(3, 0, 0)) + Place(60, "F", 999, {}, At(4, 0, 0)) +
        Place(70, "G", 0, {}, At("1e300", "0", "0") + "; m_LocalRotation: {x: 0, y: 0, z: 0, w: 0}") +
        Place(80, "H", 0, {}, "; m_LocalPosition: [1, 2]") + Place(90, "I", 91);
    EXPECT_EQ(PlacesIn(scene, {"10", "20", "30", "40", "50", "60", "80", "90"}),
              "-, -, 100 0 0, 200 0 0, 400 0 0, 400 0 0, 0 0 0, 0 0 0");
    EXPECT_NE(PlacesIn(scene, {"70"}), "-");
}

TEST_F(SceneMapTest, RotationsTurnAlikeWhateverTheirLength) {
    for (const std::string length : {"1", "3", "1e300", "1e-200", "-1e-300"}) {
        const std::string turn = "; m_LocalRotation: {x: 0, y: " + length + ", z: 0, w: " + length + "}";
        EXPECT_EQ(PlacesIn(Place(10, "A", 0, {}, turn) + Place(20, "B", 11, {}, At(1, 2, 0)), {"20"}),
                  "0 200 -100")
            << length;
    }
    const std::string none = "; m_LocalRotation: {x: 0, y: 0, z: 0, w: nan}";
    EXPECT_EQ(PlacesIn(Place(10, "A", 0, {}, none) + Place(20, "B", 11), {"10", "20"}), "0 0 0, -");
}

TEST_F(SceneMapTest, ADeepHierarchyNeedsNoStack) {
    std::string scene;
    for (int i = 1; i <= 20000; ++i) scene += Place(10 * i, "D", i > 1 ? 10 * i - 9 : 0, {}, At(1, 0, 0));
    EXPECT_EQ(PlacesIn(scene, {"200000"}), "2000000 0 0");
}

TEST_F(SceneMapTest, AnInstanceStandsWhereItsOverridesSay) {
    const auto change = [](const char* target, const char* property, const char* value) {
        return std::string(";   - target: {fileID: ") + target +
               ", guid: aa};     propertyPath: " + property + ";     value: " + value;
    };
    const std::string scene =
        Place(10, "A", 0, {}, At(1, 0, 0)) +
        Object("&20 PrefabInstance",
               "m_Modification:;   m_TransformParent: {fileID: 11};   m_Modifications:" +
                   change("5", "m_LocalPosition.x", "2") + change("5", "m_LocalPosition.z", "7") +
                   change("6", "m_LocalPosition.x", "99")) +
        "--- !o!4 &21 stripped\nTransform:\n  m_PrefabInstance: {fileID: 20}\n" +
        Place(30, "C", 21, {}, At(0, 5, 0));
    EXPECT_EQ(PlacesIn(scene, {"20", "30"}), "300 0 700, 300 500 700");
}

TEST_F(SceneMapTest, ItemsHaveThePositionsOfAllVersions) {
    const auto scene = [](const std::string& lantern) { return Place(10, "Harbour", 0, {21}) + lantern; };
    Viewed viewed(scene(Place(20, "Lantern", 11, {}, At(1, 2, 3))),
                  scene(Place(20, "Lantern", 11, {}, At(4, 2, 3))),
                  scene(Place(20, "Lantern", 11, {}, At(1, 5, 3)) + Place(30, "Hook")));
    const json top = viewed.view.Map({}), side = viewed.view.Map({MapView::Side, {}});
    EXPECT_EQ(top["items"][0].dump(), R"({"base":[1.0,3.0],"by":"both","id":"20","mark":"changed",)"
                                      R"("name":"Lantern","open":1,"ours":[4.0,3.0],"theirs":[1.0,3.0]})");
    EXPECT_EQ(side["items"][0]["theirs"], json({1.0, 5.0}));
    EXPECT_EQ(top["items"][1]["name"], "Hook");
    EXPECT_EQ(top["items"][1]["ours"], json());
    EXPECT_EQ(top["bounds"], json({0.0, 0.0, 4.0, 3.0}));
}

/// A field of posts, of which every `step`th is touched.
Viewed Field(int count, int step) {
    std::mt19937 random(7);
    std::string base, ours;
    for (int i = 1; i <= count; ++i) {
        const auto place = [&, x = random() % 500, z = random() % 300](double y) {
            return Place(10 * i, "Post", 0, {}, At(x, y, z));
        };
        base += place(0);
        ours += place(i % step == 0 ? 1 : 0);
    }
    return {base, ours, base};
}

TEST_F(SceneMapTest, EveryObjectIsToldOrCountedOnceAtAnySizeOfSquares) {
    for (const int step : {1, 4, 10000}) {
        Viewed viewed = Field(1500, step);
        for (const std::size_t cells : {1, 2, 7, 64, 128}) {
            const json map = viewed.view.Map({MapView::Top, {}, cells});
            std::size_t count = map["items"].size(), changed = 0;
            for (const json& item : map["items"]) changed += item["mark"] != "same";
            for (const json& bundle : map["bundles"]) {
                EXPECT_GT(bundle["count"], 1);
                count += bundle["count"].get<std::size_t>();
                changed += bundle["changed"].get<std::size_t>();
            }
            EXPECT_EQ(count, 1500) << cells;
            EXPECT_EQ(changed, 1500 / step) << cells;
            const std::size_t singly = 1500 / step < 1000 ? 1500 / step : 0;
            EXPECT_LE(map["items"].size() + map["bundles"].size(), cells * cells + singly);
        }
    }
}

TEST_F(SceneMapTest, SquaresShareTheBoxEvenlyAndItsEdgesAreIn) {
    std::string scene;
    for (int i = 0; i < 4; ++i) scene += Place(10 * i + 10, "Post", 0, {}, At(i, 0, 0));
    Viewed viewed(scene, scene, scene);
    EXPECT_EQ(viewed.view.Map({MapView::Top, {}, 4})["items"].size(), 4);
    const json bundles = viewed.view.Map({MapView::Top, {}, 2})["bundles"];
    ASSERT_EQ(bundles.size(), 2);
    EXPECT_EQ(bundles[0]["box"], json({0.0, 0.0, 1.0, 0.0}));
    EXPECT_EQ(bundles[1]["x"], 2.5);
    EXPECT_EQ(viewed.view.Map({MapView::Top, MapBox{1, 0, 2, 0}, 4})["items"].size(), 2);
}

TEST_F(SceneMapTest, ABoxShowsWhatIsInIt) {
    Viewed viewed = Field(1500, 10);
    std::size_t count = 0;
    for (const auto& [x0, x1] : {std::pair(-1.0, 249.5), {249.5, 600.0}}) {
        const json map = viewed.view.Map({MapView::Top, MapBox{x0, -1, x1, 600}, 16});
        count += map["items"].size();
        for (const json& bundle : map["bundles"]) {
            count += bundle["count"].get<std::size_t>();
            EXPECT_GE(bundle["box"][0], x0);
            EXPECT_LE(bundle["box"][2], x1);
        }
    }
    EXPECT_EQ(count, 1500);
    EXPECT_TRUE(viewed.view.Map({MapView::Top, MapBox{900, 900, 901, 901}, 16})["items"].empty());
}

TEST_F(SceneMapTest, ASceneWithoutPlacesHasAMap) {
    Viewed viewed(Object("&1 Rust", "m_A: 1"), Object("&1 Rust", "m_A: 2"), Object("&1 Rust", "m_A: 1"));
    EXPECT_EQ(viewed.view.Map({}).dump(), R"({"bounds":null,"bundles":[],"items":[],"unplaced":0})");
    Viewed broken(Place(10, "A", 0, {}, At("x", "0", "0")), Place(10, "A"),
                  Place(10, "A", 0, {}, At("x", "0", "0")));
    EXPECT_EQ(broken.view.Map({})["items"][0]["base"], json());
}

} // namespace
