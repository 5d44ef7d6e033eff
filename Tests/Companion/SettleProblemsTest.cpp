#include "Settle/Problems.h"

#include "OpenScenes.h"
#include "ReviewScene.h"

#include <gtest/gtest.h>

namespace {

using namespace open_scenes;
using review_scene::Object;
using review_scene::Place;

struct SettleProblemsTest : testing::Test {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }

    SettleSession& Settle(const std::string& base, const std::string& ours, const std::string& theirs) {
        return *(session = SessionOf({kHeader + base, kHeader + ours, kHeader + theirs}));
    }
    /// A line for each problem, and below it one for each remedy.
    std::string Told() const {
        std::string told;
        for (const Problem& problem : session->Problems()) {
            told += problem.text + "\n";
            for (const Remedy& remedy : problem.remedies) told += "  " + remedy.text + "\n";
        }
        return told;
    }
    /// Takes that remedy of the first problem.
    void Mend(std::size_t remedy) {
        const std::vector<Decision> decisions = session->Problems().at(0).remedies.at(remedy).decisions;
        EXPECT_TRUE(session->Decide(decisions).empty());
    }

    std::unique_ptr<SettleSession> session;
};

std::string Holder(const std::string& fields) {
    return Object("&90 MonoBehaviour", fields);
}

TEST_F(SettleProblemsTest, ReferenceIsToldAtAnyDepth) {
    const std::string lantern = Place(20, "Lantern");
    for (const auto& [place, body] :
         std::map<std::string, std::string>{{"m_Target", "m_Target: {fileID: 20}"},
                                            {"m_Slots[1]", "m_Slots: [{fileID: 0}, {fileID: 20}]"},
                                            {"m_Slots[0].item", "m_Slots: [{item: {fileID: 20}}]"},
                                            {"m_A.m_B", "m_A: {m_B: {fileID: 20, type: 2}}"}}) {
        Settle(lantern + Holder("m_X: 1"), lantern + Holder("m_X: 1; " + body), Holder("m_X: 1"));
        EXPECT_EQ(Told().substr(0, Told().find('\n')),
                  "MonoBehaviour: " + place + " refers to Lantern, which was removed by theirs");
    }
    Settle(lantern + Holder("m_X: 1"), lantern + Holder("m_T: {fileID: 20, guid: 4f, type: 3}"),
           Holder("m_X: 1"));
    EXPECT_EQ(Told(), ""); // into another file
}

// No program writes such objects, and any file may have them.
TEST_F(SettleProblemsTest, ObjectMayBeAReferenceItself) {
    const auto holder = [](int id) {
        return "--- !o!114 &90\nMonoBehaviour: {fileID: " + std::to_string(id) + "}\n";
    };
    const std::string lantern = Place(20, "Lantern");
    Settle(lantern + holder(0), lantern + holder(20), holder(0));
    EXPECT_EQ(Told().substr(0, Told().find('\n')),
              "MonoBehaviour refers to Lantern, which was removed by theirs");
    const std::size_t remedies = session->Problems()[0].remedies.size();
    EXPECT_GE(remedies, 2);
    for (std::size_t remedy = 0; remedy < remedies; ++remedy) {
        Mend(remedy);
        EXPECT_EQ(Told(), "") << remedy;
        session->Undo();
    }
}

TEST_F(SettleProblemsTest, WhatEitherSideHadAlreadyIsNone) {
    const std::string lantern = Place(20, "Lantern"), torn = Holder("m_Target: {fileID: 20}");
    Settle(lantern + Holder("m_X: 1"), lantern + torn, torn);
    EXPECT_EQ(Told(), "");
    Settle(torn, torn + Place(30, "Boat"), torn + Place(40, "Pier"));
    EXPECT_EQ(Told(), "");
}

// Ours moves the lantern from the pier to the harbour, which theirs removes.
TEST_F(SettleProblemsTest, LostParentIsToldWithWaysBack) {
    const auto scene = [](int father) {
        std::string text = Place(10, "Pier", 0, father == 11 ? std::vector{21} : std::vector<int>()) +
                           Place(20, "Lantern", father);
        return text + Place(30, "Harbour", 0, father == 31 ? std::vector{21} : std::vector<int>());
    };
    const std::string theirs = Place(10, "Pier", 0, {21}) + Place(20, "Lantern", 11);
    Settle(scene(11), scene(31), theirs);
    ASSERT_EQ(session->Open().size(), 1);
    EXPECT_EQ(Told(), ""); // the conflict tells it
    session->Decide({{"31", Side::Theirs}}, SettleSession::Follow::No);
    const std::string told = Told();
    EXPECT_NE(told.find("Lantern stands at the top, since Harbour, which it stood below, was removed by "
                        "theirs\n  keep Harbour, too\n"),
              std::string::npos)
        << told;
    EXPECT_NE(told.find("  take Harbour/Lantern from theirs\n"), std::string::npos) << told;
}

// Of what stands for an object of a prefab nothing is left without the instance.
TEST_F(SettleProblemsTest, ObjectOfAPrefabIsKeptWithItsInstance) {
    const std::string boat =
        "--- !o!1001 &50\nPrefabInstance:\n  m_Modification: {m_Modifications: [{target: {fileID: 7, guid: "
        "4f}, propertyPath: m_Name, value: Boat}]}\n--- !o!4 &51 stripped\nTransform:\n  m_PrefabInstance: "
        "{fileID: 50}\n";
    Settle(boat + Holder("m_X: 1"), boat + Holder("m_X: 1; m_Target: {fileID: 51}"), Holder("m_X: 1"));
    EXPECT_EQ(Told().substr(0, Told().find("  take")),
              "MonoBehaviour: m_Target refers to Boat · Transform, which was removed by theirs\n"
              "  keep Boat, too\n");
    Mend(0);
    EXPECT_EQ(Told(), "");
    EXPECT_NE(session->Result().find("Boat"), std::string::npos);
}

TEST_F(SettleProblemsTest, TwoHundredAreToldAndTheOthersByTheirNumber) {
    const std::string lantern = Place(20, "Lantern");
    std::string base, ours;
    for (int id = 1000; id < 1250; ++id) {
        base += Object("&" + std::to_string(id) + " MonoBehaviour", "m_X: 1");
        ours += Object("&" + std::to_string(id) + " MonoBehaviour", "m_X: 1; m_Target: {fileID: 20}");
    }
    Settle(lantern + base, lantern + ours, base);
    ASSERT_EQ(session->Problems().size(), 201);
    EXPECT_EQ(session->Problems().back().text, "and 50 more of the kind");
    EXPECT_TRUE(session->Problems().back().remedies.empty());
    Mend(0);
    EXPECT_TRUE(session->Problems().empty());
}

/// A harbour with these below it.
std::string HarbourWith(const std::map<int, std::string>& names, int layer = 0) {
    std::vector<int> children;
    std::string below;
    for (const auto& [id, name] : names) {
        children.push_back(id + 1);
        below += Place(id, name, 11, {}, "", "; m_Layer: " + std::to_string(layer));
    }
    return Place(10, "Harbour", 0, children) + below;
}

// The list of children can't be taken from one side for one of two alone.
TEST_F(SettleProblemsTest, KeptObjectThatItsListLacksIsToldAndMended) {
    const std::map<int, std::string> both = {{20, "Lantern"}, {30, "Buoy"}};
    Settle(HarbourWith(both), HarbourWith(both, 5), HarbourWith({}));
    session->Decide({{"20", Side::Ours}});
    EXPECT_EQ(Told(), "Harbour/Lantern isn't in the list of children of Harbour\n  remove Harbour/Lantern, "
                      "too\n  take Harbour from ours\n  take Harbour from base\n");
    Mend(1);
    EXPECT_EQ(Told(), "");
    session->Decide({{"30", Side::Ours}});
    EXPECT_EQ(session->Result(), kHeader + HarbourWith(both, 5));
}

TEST_F(SettleProblemsTest, ListFollowsAllThatAreKeptOfItOneByOne) {
    const std::map<int, std::string> both = {{20, "Lantern"}, {30, "Buoy"}};
    Settle(HarbourWith(both), HarbourWith(both, 5), HarbourWith({}));
    const std::vector<Decision> decisions = {{"20", Side::Ours}, {"30", Side::Base}};
    session->Decide({decisions[0]});
    session->Decide({decisions[1]});
    EXPECT_EQ(Told(), "");
    const std::string result = session->Result();
    EXPECT_NE(result.find("m_Children: [{fileID: 21}, {fileID: 31}]"), std::string::npos) << result;
    EXPECT_TRUE(session->Undo() && session->Undo());
    session->Decide(decisions); // as one step
    EXPECT_EQ(session->Result(), result);
    session->Undo();
    session->TakeAll(Side::Theirs, [](const OpenConflict&) { return true; });
    EXPECT_EQ(session->Result(), kHeader + HarbourWith({}));
}

TEST_F(SettleProblemsTest, AnotherSideTakesBackWhatFollowedFromTheFirst) {
    const std::string lantern = HarbourWith({{20, "Lantern"}}), none = HarbourWith({});
    const ThreeTexts texts = {kHeader + lantern, kHeader + HarbourWith({{20, "Lantern"}}, 5), kHeader + none};
    for (const Side first : {Side::Base, Side::Ours, Side::Theirs})
        for (const Side second : {Side::Base, Side::Ours, Side::Theirs}) {
            const auto once = SessionOf(texts), twice = SessionOf(texts);
            once->Decide({{"20", second}});
            twice->Decide({{"20", first}});
            twice->Decide({{"20", second}});
            EXPECT_EQ(twice->Result(), once->Result()) << SideName(first) << SideName(second);
            EXPECT_TRUE(twice->IsSettled() && twice->Problems().empty());
        }
}

// Ours changes the lantern and its Transform, both of which theirs removes.
TEST_F(SettleProblemsTest, WhatFollowsOverrulesNoDecisionThatKeepsTheSameObjects) {
    const auto scene = [](int layer) {
        const std::string number = std::to_string(layer);
        return Place(20, "Lantern", 0, {}, "; m_Order: " + number, "; m_Layer: " + number);
    };
    for (const auto& [first, second] : std::map<std::string, std::string>{{"20", "21"}, {"21", "20"}}) {
        Settle(scene(1) + Place(30, "Pier"), scene(2) + Place(30, "Pier"), Place(30, "Pier"));
        session->Decide({{first, Side::Base}});
        session->Decide({{second, Side::Ours}});
        const std::string result = session->Result();
        EXPECT_NE(result.find(first == "20" ? "m_Layer: 1" : "m_Order: 1"), std::string::npos) << result;
        EXPECT_NE(result.find(first == "20" ? "m_Order: 2" : "m_Layer: 2"), std::string::npos) << result;
        session->Decide({{first, Side::Theirs}}); // and takes back what followed
        EXPECT_EQ(session->Result(), kHeader + Place(30, "Pier"));
        session->Decide({{first, Side::Base}});
        EXPECT_EQ(Told(), "");
    }
}

} // namespace
