#include "ReviewScene.h"

#include "Support/RandomDocuments.h"
#include "Words/Failure.h"

#include "SceneGenerator.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <random>
#include <set>
#include <sstream>

// What holds of the views of any merge, be its scenes damaged or made to do harm.

namespace {

using namespace review_scene;
using nlohmann::json;
using Scene = std::vector<std::string>;

/// Objects that stand anywhere: under each other, in loops, under what isn't there, or none.
class RandomHierarchy {
public:
    explicit RandomHierarchy(unsigned seed) : m_Random(seed) {}

    Scene Make() {
        Scene scene(kCount);
        for (std::size_t i = 0; i < scene.size(); ++i) scene[i] = Object(i);
        return scene;
    }
    /// With a few of its objects made anew.
    Scene Edited(Scene scene) {
        for (std::size_t edits = Below(5); edits-- > 0;) {
            const std::size_t i = Below(kCount);
            scene[i] = Object(i);
        }
        return scene;
    }

    static constexpr std::size_t kCount = 12;

private:
    std::size_t Below(std::size_t limit) { return m_Random() % limit; }
    /// An id as the objects have them, and now and then another.
    int Transform() { return static_cast<int>(Below(8) ? 10 * Below(kCount + 1) + 11 : Below(3)); }
    std::string Number() {
        static const char* const kNumbers[] = {"1e300", "nan", "x", "-0", "1e-320"};
        return Below(30) ? std::to_string(Below(9)) : kNumbers[Below(std::size(kNumbers))];
    }
    std::string Vector(const std::string& name) {
        return "; m_Local" + name + ": {x: " + Number() + ", y: " + Number() + ", z: " + Number() +
               (name == "Rotation" ? ", w: " + Number() + "}" : "}");
    }
    std::string Object(std::size_t index) {
        const int id = static_cast<int>(10 * index + 10);
        std::string fields = Vector("Position");
        for (const char* field : {"Rotation", "Scale"})
            if (Below(3) == 0) fields += Vector(field);
        const std::string whole =
            Place(id, "P" + std::to_string(Below(3)), Transform(), {Transform(), Transform()}, fields);
        const std::string own = std::to_string(id), next = std::to_string(id + 1);
        switch (Below(10)) {
        case 0:
            return "";
        case 1:
            return whole.substr(whole.find("---", 1)); // without the GameObject
        case 2:
            return review_scene::Object(
                       "&" + own + " PrefabInstance",
                       "m_Modification:;   m_TransformParent: {fileID: " + std::to_string(Transform()) +
                           "};   m_Modifications:;   - target: {fileID: 5};     propertyPath: "
                           "m_LocalPosition.y;     value: " +
                           Number()) +
                   "--- !o!4 &" + next + " stripped\nTransform:\n  m_PrefabInstance: {fileID: " + own + "}\n";
        case 3:
            return review_scene::Object("&" + next + " Light", "m_GameObject: {fileID: " + own + "}") +
                   review_scene::Object("&" + own + " Rust", "m_V: " + Number());
        default:
            return whole;
        }
    }

    std::mt19937 m_Random;
};

std::string TextOf(const Scene& scene) {
    std::string text;
    for (const std::string& object : scene) text += object;
    return text + Object("&5000 Last", "m_V: 1");
}

std::size_t CountOf(const json& map) {
    std::size_t count = map["items"].size() + map["unplaced"].get<std::size_t>();
    for (const json& bundle : map["bundles"]) count += bundle["count"].get<std::size_t>();
    return count;
}

/// Every object stands in the tree once, behind what it stands under, and numbers are those of what is below.
void CheckTree(const SceneTree& tree) {
    const std::span<const MarkedNode> nodes = tree.Nodes();
    std::set<MergeNames::ID> ids;
    std::vector<std::uint32_t> sizes(nodes.size(), 1), touched(nodes.size()), open(nodes.size());
    for (std::size_t i = nodes.size(); i-- > 0;) {
        const MarkedNode& node = nodes[i];
        EXPECT_TRUE(ids.insert(node.id).second);
        EXPECT_EQ(tree.Find(node.id), i);
        EXPECT_EQ(node.size, sizes[i]);
        EXPECT_EQ(node.touchedBelow, touched[i]);
        EXPECT_EQ(node.openBelow, open[i]);
        if (node.parent == MarkedNode::kTop) continue;
        ASSERT_LT(node.parent, i);
        EXPECT_LE(i + node.size, node.parent + nodes[node.parent].size);
        sizes[node.parent] += sizes[i];
        touched[node.parent] += touched[i] + (node.mark.IsTouched() ? 1 : 0);
        open[node.parent] += open[i] + node.open;
    }
}

/// An object that was changed, or is open, has a row that says so, and one that nobody touched has none; each
/// conflict has one.
void CheckRows(Viewed& viewed) {
    std::vector<int> told(viewed.merge.Open().size());
    for (const MarkedNode& node : viewed.view.Nodes().Nodes()) {
        const json page = viewed.view.Object(node.id->Value(), false);
        for (const json& row : page["rows"])
            if (row["item"].is_number()) ++told[row["item"]];
        EXPECT_NO_THROW(static_cast<void>(page.dump()));
        if (node.mark.isChanged || node.open) {
            EXPECT_FALSE(page["rows"].empty()) << page;
        }
        EXPECT_GE(page["rows"].size(), node.open);
    }
    for (std::size_t i = 0; i < told.size(); ++i)
        EXPECT_EQ(told[i], 1) << ovrin_yaml::PathToString(viewed.merge.Open()[i].path);
}

void CheckMap(Viewed& viewed) {
    const auto places = std::ranges::count(viewed.view.Nodes().Nodes(), NodeKind::Place, &MarkedNode::kind);
    for (const std::size_t cells : {1, 3, 128})
        for (const MapView view : {MapView::Top, MapView::Side}) {
            const json map = viewed.view.Map({view, {}, cells});
            EXPECT_EQ(CountOf(map), static_cast<std::size_t>(places));
            EXPECT_NO_THROW(static_cast<void>(map.dump()));
        }
}

void CheckAll(Viewed& viewed) {
    CheckTree(viewed.view.Nodes());
    CheckRows(viewed);
    CheckMap(viewed);
}

/// Of 60 merges those that can be made. Returns their number.
int CheckMerges(const std::function<ThreeTexts()>& make) {
    int merged = 0;
    for (int round = 0; round < 60 && !testing::Test::HasFailure(); ++round) {
        const ThreeTexts texts = make();
        try {
            Viewed viewed(texts.base, texts.ours, texts.theirs);
            CheckAll(viewed);
            ++merged;
        } catch (const Failure&) { // can't be read, or merged
        }
        EXPECT_FALSE(testing::Test::HasFailure()) << round;
    }
    return merged;
}

struct ReviewLaws : testing::TestWithParam<unsigned> {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }
};

TEST_P(ReviewLaws, HoldOfAnyHierarchy) {
    RandomHierarchy random(GetParam());
    EXPECT_GT(CheckMerges([&] {
                  const Scene base = random.Make();
                  return ThreeTexts{TextOf(base), TextOf(random.Edited(base)), TextOf(random.Edited(base))};
              }),
              20);
}

TEST_P(ReviewLaws, HoldOfDamagedObjects) {
    random_documents::RandomDocuments random(GetParam());
    EXPECT_GT(CheckMerges([&] {
                  std::string base;
                  for (int id = 1; id <= 2; ++id)
                      base += "--- !o!1 &" + std::to_string(id) + "\n" + random.Body();
                  return ThreeTexts{base, random.Damaged(base), random.Damaged(base)};
              }),
              2);
}

TEST_P(ReviewLaws, HoldOfEditsOfManyKinds) {
    std::ostringstream files[3];
    ovrin_bench::GenerateScene({.seed = GetParam(), .objects = 200, .edited = 200'000, .conflicts = 20},
                               {files[0], files[1], files[2], nullptr});
    const auto objects = [&](int file) { return files[file].str().substr(files[file].str().find("---")); };
    Viewed viewed(objects(0), objects(2), objects(1));
    EXPECT_GE(viewed.merge.Open().size(), 20u);
    CheckAll(viewed);
}

/// The places of a side are found from those of the base and what the side touched.
TEST_P(ReviewLaws, PlacesAreThoseOfTheFileAlone) {
    RandomHierarchy random(GetParam());
    for (int round = 0; round < 200; ++round) {
        const Scene base = random.Make();
        Viewed viewed(TextOf(base), TextOf(random.Edited(base)), TextOf(base));
        const ObjectNames& ours = viewed.names.In(Version::Ours);
        const WorldPlaces before(viewed.names.In(Version::Base)), alone(ours);
        const WorldPlaces after(before, viewed.merge.Session().RightDiff(), ours);
        for (std::size_t i = 0; i < RandomHierarchy::kCount; ++i) {
            const auto* id = ovrin_yaml::YAMLScalar::Lookup(std::to_string(10 * i + 10));
            const Point *one = after.Find(id), *other = alone.Find(id);
            ASSERT_EQ(one == nullptr, other == nullptr) << round << ": " << 10 * i + 10;
            if (one) {
                EXPECT_EQ(std::tie(one->x, one->y, one->z), std::tie(other->x, other->y, other->z)) << round;
            }
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Seeds, ReviewLaws, testing::Values(1, 2, 3));

} // namespace
