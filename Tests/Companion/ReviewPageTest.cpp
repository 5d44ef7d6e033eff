#include "Review/ReviewPage.h"

#include "ErrorOf.h"
#include "ReviewScene.h"
#include "Words/Failure.h"

#include <csignal>
#include <gtest/gtest.h>
#include <unistd.h>

namespace {

using namespace review_scene;
using failures::ErrorOf;
using nlohmann::json;
using Query = std::map<std::string, std::string>;
using Read = std::function<std::optional<ThreeTexts>()>;

ThreeTexts Texts(const std::string& base, const std::string& ours, const std::string& theirs) {
    return {File(base), File(ours), File(theirs)};
}

/// A scene with `count` conflicts, an object that ours added and one that theirs removed.
Read Conflicts(int count) {
    return [count] {
        std::string texts[3];
        for (int i = 0; i < 3; ++i) {
            for (int id = 1; id <= count; ++id)
                texts[i] += Place(10 * id, "Post", 0, {}, "; m_Layer: " + std::to_string(i));
            if (i == 1) texts[i] += Place(1000, "Gull");
            if (i != 2) texts[i] += Place(2000, "Boat");
        }
        return Texts(texts[0], texts[1], texts[2]);
    };
}

/// A review of these files, "0.ovrin" and so on.
struct Reviewed {
    explicit Reviewed(const std::vector<Read>& reads, bool isMerge = true)
        : page(Sources(reads, isMerge), {}, [this](std::size_t done, std::size_t all) {
              EXPECT_EQ(done, ++looks);
              count = all;
          }) {
        EXPECT_EQ(looks, reads.size());
        EXPECT_TRUE(reads.empty() || count == reads.size());
    }
    static ReviewSources Sources(const std::vector<Read>& reads, bool isMerge) {
        ReviewSources sources{{}, isMerge, "ours is main"};
        for (const Read& read : reads)
            sources.files.push_back({std::to_string(sources.files.size()) + ".ovrin", {}, read});
        return sources;
    }

    PageAnswer Ask(const std::string& path, const Query& query = {}) {
        return page.Answer({"GET", "api/" + path, query, ""});
    }
    json Get(const std::string& path, const Query& query = {}) {
        const PageAnswer answer = Ask(path, query);
        EXPECT_EQ(answer.status, 200) << answer.body;
        return json::parse(answer.body);
    }
    json Whole() {
        std::size_t leftOut = 77;
        const json whole = json::parse(page.Whole([](std::size_t, std::size_t) {}, leftOut));
        EXPECT_EQ(leftOut, 0u);
        return whole;
    }

    std::size_t looks = 0, count = 0;
    ReviewPage page;
};

struct ReviewPageTest : testing::Test {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }
};

const std::vector<Read> kAllKinds = {Conflicts(2), []() -> std::optional<ThreeTexts> { return std::nullopt; },
                                     []() -> std::optional<ThreeTexts> { throw Failure("no such blob"); },
                                     [] {
                                         return ThreeTexts{"", "<<<<<<< ours\n", "\xff"};
                                     },
                                     Conflicts(0)};
const std::vector<Read> kAllEnds = {[]() -> std::optional<ThreeTexts> { _exit(3); },
                                    []() -> std::optional<ThreeTexts> { throw std::bad_alloc(); },
                                    [] { return kill(getpid(), SIGKILL), ThreeTexts(); }};

/// Few are held by processes, and many are looked at by others.
TEST_F(ReviewPageTest, FileIsTheSameAmongFewAndAmongMany) {
    Reviewed many(kAllKinds);
    EXPECT_EQ(many.page.CountScenes(), 4u);
    EXPECT_EQ(many.page.CountOthers(), 1u);
    json scenes = many.Get("session")["scenes"], alone = json::array();
    for (std::size_t i = 0; i < kAllKinds.size(); ++i) {
        Reviewed one({kAllKinds[i]});
        const json session = one.Get("session");
        for (json scene : session["scenes"]) {
            scene["path"] = std::to_string(i) + ".ovrin";
            alone.push_back(scene);
        }
    }
    EXPECT_EQ(scenes, alone);
    EXPECT_EQ(scenes[1]["problem"], "no such blob");
    EXPECT_EQ(scenes[3]["counts"], (json{{"added", 2}, {"removed", 2}, {"changed", 0}, {"moved", 0}}));
    EXPECT_EQ(many.page.Problems()[0], "2.ovrin: no such blob");
}

TEST_F(ReviewPageTest, EndOfAProcessIsAProblemOfItsSceneAlone) {
    for (const std::size_t others : {0, 2}) {
        std::vector<Read> reads = kAllEnds;
        reads.resize(reads.size() + others, Conflicts(1));
        Reviewed review(reads);
        EXPECT_EQ(review.page.Problems().size(), kAllEnds.size());
        const json session = review.Get("session");
        EXPECT_EQ(session["open"], others);
        for (std::size_t i = 0; i < reads.size(); ++i)
            EXPECT_EQ(session["scenes"][i]["problem"].is_string(), i < kAllEnds.size()) << i;
        EXPECT_EQ(review.Get("conflicts")["items"].size(), others);
        EXPECT_GE(review.Ask("tree", {{"scene", "0"}}).status, 400);
        EXPECT_EQ(review.Whole()["scenes"].size(), reads.size());
    }
}

TEST_F(ReviewPageTest, SceneWhoseProcessEndedIsReadAgain) {
    bool ends = false;
    const Read mortal = [&] { return ends ? kAllEnds[0]() : Conflicts(1)(); };
    Reviewed review({mortal, Conflicts(1), Conflicts(1), Conflicts(1)});
    ends = true;
    for (int time = 0; time < 2; ++time)
        EXPECT_NE(review.Ask("tree").body.find("came to its end: ask again"), std::string::npos);
    EXPECT_EQ(review.Ask("tree", {{"scene", "1"}}).status, 200);
    ends = false;
    EXPECT_EQ(review.Ask("tree").status, 200);
}

TEST_F(ReviewPageTest, ConflictsAreOneListOverAllScenes) {
    Reviewed review({Conflicts(0), Conflicts(3), kAllKinds[1], Conflicts(1), Conflicts(0), Conflicts(4)});
    const json all = review.Get("conflicts")["items"];
    ASSERT_EQ(all.size(), 8u);
    for (std::size_t i = 0; i < all.size(); ++i) {
        EXPECT_EQ(all[i]["index"], i);
        EXPECT_EQ(all[i]["scene"], i < 3 ? 1 : i < 4 ? 2 : 4);
    }
    for (std::size_t from = 0; from <= 9; ++from)
        for (std::size_t count = 0; count <= 9; ++count) {
            json part = json::array();
            for (std::size_t i = from; i < std::min<std::size_t>(8, from + count); ++i)
                part.push_back(all[i]);
            const json page =
                review.Get("conflicts", {{"from", std::to_string(from)}, {"count", std::to_string(count)}});
            EXPECT_EQ(page, (json{{"total", 8}, {"items", part}})) << from << " " << count;
        }
}

/// What a page that is one file has is what one that is served would be told.
TEST_F(ReviewPageTest, WholeSaysWhatIsServed) {
    for (const std::vector<Read>& reads :
         {std::vector{Conflicts(3)}, {Conflicts(1), kAllKinds[2], Conflicts(0), Conflicts(2)}}) {
        Reviewed review(reads);
        const json whole = review.Whole();
        EXPECT_EQ(whole["session"], review.Get("session"));
        EXPECT_EQ(whole["conflicts"], review.Get("conflicts")["items"]);
        ASSERT_EQ(whole["scenes"].size(), reads.size());
        for (std::size_t i = 0; i < reads.size(); ++i) {
            const json& scene = whole["scenes"][i];
            const std::string number = std::to_string(i);
            if (!whole["session"]["scenes"][i]["problem"].is_null()) {
                EXPECT_TRUE(scene["tree"].empty() && scene["objects"].empty());
                continue;
            }
            json top = json::array();
            for (json node : scene["tree"]) {
                if (!node["parent"].is_null()) continue;
                node.erase("parent");
                top.push_back(node);
            }
            EXPECT_EQ(top, review.Get("tree", {{"scene", number}, {"changed", "1"}})["nodes"]);
            EXPECT_GE(scene["objects"].size(), 4u);
            for (const auto& [id, object] : scene["objects"].items())
                EXPECT_EQ(object, review.Get("object", {{"scene", number}, {"id", id}}));
            for (const char* view : {"top", "side"})
                EXPECT_EQ(scene["map"][view], review.Get("map", {{"scene", number}, {"view", view}}));
        }
    }
}

TEST_F(ReviewPageTest, SceneThatWasChangedMeanwhileIsNotMixedWithWhatWasSeen) {
    int conflicts = 2;
    const Read changing = [&] { return Conflicts(conflicts)(); };
    Reviewed review({changing, Conflicts(1), Conflicts(1), Conflicts(1)});
    conflicts = 3;
    EXPECT_EQ(review.Ask("tree", {{"scene", "0"}}).status, 409);
    EXPECT_EQ(review.Ask("conflicts").status, 409);
    EXPECT_EQ(review.Ask("conflicts", {{"from", "2"}}).status, 200);
    EXPECT_EQ(ErrorOf<Failure>([&] { review.Whole(); }),
              "0.ovrin: The scene was changed since the review began: begin it again");
}

TEST_F(ReviewPageTest, RequestsThatItCannotAnswerAreRefused) {
    Reviewed review({Conflicts(1)}), none({});
    const std::tuple<const char*, Query, int> refused[] = {
        {"tree", {{"scene", "1"}}, 404},
        {"tree", {{"scene", "99999999999999999999"}}, 400},
        {"tree", {{"scene", "-1"}}, 400},
        {"nothing", {}, 404},
        {"conflicts", {{"from", "x"}}, 400},
        {"conflicts", {{"count", "1 "}}, 400},
        {"map", {{"view", "front"}}, 400},
        {"map", {{"x0", "2"}, {"x1", "1"}, {"y0", "0"}, {"y1", "1"}}, 400},
        {"object", {{"id", "10.Transform"}}, 404}};
    for (const auto& [path, query, status] : refused) {
        const PageAnswer answer = review.Ask(path, query);
        EXPECT_EQ(answer.status, status) << path;
        EXPECT_FALSE(json::parse(answer.body)["error"].empty());
    }
    for (const char* method : {"POST", "PUT", "LOOK", "ALL", ""})
        EXPECT_EQ(review.page.Answer({method, "api/tree", {}, ""}).status, 405);
    EXPECT_EQ(none.Ask("tree").status, 404);
    EXPECT_EQ(none.Whole()["scenes"], json::array());
    EXPECT_EQ(none.Get("conflicts")["total"], 0);
}

/// Nothing that a scene says may act on a terminal or a page, or stop an answer.
TEST_F(ReviewPageTest, ForeignWordsComeAsTextThatCanBeShown) {
    const std::string name = R"("\e[2J\0\u202E</script>\n\xFF")";
    const auto scene = [&](int value) {
        return Place(10, name, 0, {},
                     "; " + name + ": " + std::to_string(value) + "; m_Next: {fileID: " + name + "}") +
               Object("&\x80\xfe Material", "m_Name: '\xff'; m_V: " + std::to_string(value));
    };
    Reviewed review({[&] { return Texts(scene(1), scene(2), scene(3)); }});
    for (const std::string& text :
         {review.Ask("tree").body, review.Ask("object", {{"id", "11"}, {"all", "1"}}).body,
          review.Ask("conflicts").body, review.Ask("map").body,
          review.Ask("find", {{"text", "\xff"}}).body}) {
        ASSERT_TRUE(json::accept(text)) << text;
        EXPECT_EQ(text.find("\\u00"), std::string::npos) << text;
        EXPECT_EQ(text.find("\u202E"), std::string::npos) << text;
    }
}

} // namespace
