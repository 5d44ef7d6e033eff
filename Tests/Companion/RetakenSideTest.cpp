#include "OpenScenes.h"

#include <gtest/gtest.h>

namespace {

using namespace open_scenes;

constexpr Side kSides[] = {Side::Base, Side::Ours, Side::Theirs};

/// A lamp, 10, with its place, 11, and its script, 12.
std::string Lamp(int layer, int range) {
    return "--- !o!1 &10\nGameObject:\n  m_Component:\n  - component: {fileID: 11}\n  - component: {fileID: "
           "12}\n  m_Layer: " +
           std::to_string(layer) +
           "\n  m_Name: Lamp\n--- !o!4 &11\nTransform:\n  m_GameObject: {fileID: 10}\n  m_Father: {fileID: "
           "0}\n--- !o!114 &12\nMonoBehaviour:\n  m_GameObject: {fileID: 10}\n  m_Range: " +
           std::to_string(range) + "\n";
}

/// Theirs removes the lamp, of which ours changes the GameObject and the script.
struct RetakenSideTest : testing::Test {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }
    void Take(const std::string& path, Side side) const {
        EXPECT_TRUE(session->Decide({{path, side}}).empty());
    }
    std::optional<Side> SideOf(const std::string& path) const {
        for (const SettleSession::Met& met : session->Conflicts())
            if (met.conflict->path.front()->Value() == path) return met.decided;
        return {};
    }

    const std::string rest = Object(20, "1", "Buoy");
    const std::unique_ptr<SettleSession> session =
        SessionOf({kHeader + Lamp(1, 1) + rest, kHeader + Lamp(2, 2) + rest, kHeader + rest});
};

TEST_F(RetakenSideTest, LastSideOfAnObjectCountsWhateverWasTakenBefore) {
    for (const std::string path : {"10", "12"})
        for (const Side first : kSides)
            for (const Side second : kSides) {
                Take(path, second);
                const std::string alone = session->Result();
                session->Undo();
                Take(path, first);
                Take(path, second);
                EXPECT_EQ(session->Result(), alone) << path << SideName(first) << SideName(second);
                EXPECT_EQ(SideOf(path), second) << path << SideName(first);
                EXPECT_TRUE(session->Undo() && session->Undo());
            }
}

TEST_F(RetakenSideTest, ObjectOfBaseStaysSoWhereWhatItBelongsToIsKept) {
    for (const auto& [kept, other] : {std::pair("10", "12"), {"12", "10"}})
        for (const Side side : {Side::Base, Side::Ours}) {
            Take(kept, Side::Base);
            Take(other, side);
            EXPECT_EQ(SideOf(kept), Side::Base) << kept << SideName(side);
            EXPECT_EQ(SideOf(other), side) << kept;
            const int layer = (side == Side::Ours && kept == std::string("12")) ? 2 : 1;
            const int range = (side == Side::Ours && kept == std::string("10")) ? 2 : 1;
            EXPECT_EQ(session->Result(), kHeader + Lamp(layer, range) + rest);
            EXPECT_TRUE(session->Undo() && session->Undo());
        }
}

} // namespace
