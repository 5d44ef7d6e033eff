#include "Names/ObjectNames.h"

#include "Support/ObjectText.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin;
using object_text::Id;
using object_text::Scene;

const char* const kHarbour = R"(
1 &10 GameObject: {m_Component: [{component: {fileID: 11}}], m_Name: Harbour}
4 &11 Transform: {m_GameObject: {fileID: 10}, m_Children: [{fileID: 41}, {fileID: 21}], m_Father: {fileID: 0}}
1 &20 GameObject: {m_Component: [{4: {fileID: 21}}, {108: {fileID: 22}}, {108: {fileID: 23}}, {114: {fileID: 24}}], m_Name: Lantern}
4 &21 Transform: {m_GameObject: {fileID: 20}, m_Children: [], m_Father: {fileID: 11}}
108 &22 Light: {m_GameObject: {fileID: 20}}
108 &23 Light: {m_GameObject: {fileID: 20}}
114 &24 MonoBehaviour: {m_GameObject: {fileID: 20}, m_Script: {fileID: 7, guid: 4f0c2b7de19a48f6b3d5a7c80e6f1d24, type: 3}}
21 &40 PrefabInstance: {m_Modification: {m_TransformParent: {fileID: 11}, m_Modifications: [{target: {fileID: 9, guid: aa}, propertyPath: m_Name, value: Boat}]}}
4 &41 stripped Transform: {m_PrefabInternal: {fileID: 40}}
21 &50 PrefabInstance: {m_Modification: {m_TransformParent: {fileID: 41}}, m_Source: {fileID: 1, guid: c5a81f3e07d64b92ae30d9b7f6184c2d}}
21 &60 Material: {m_Name: Rust}
104 &61 RenderSettings: {}
)";

std::string NameOf(const char* lines, const char* id) {
    Scene scene(lines);
    return ObjectNames(scene.Root()).NameWithID(Id(id));
}

TEST(ObjectNames, GameObjectsHaveTheNamesOfTheirParents) {
    EXPECT_EQ(NameOf(kHarbour, "20"), "Harbour/Lantern (20)");
    EXPECT_EQ(NameOf(kHarbour, "10"), "Harbour (10)");
}

TEST(ObjectNames, ComponentsAreCountedWhereTheirClassRepeats) {
    EXPECT_EQ(NameOf(kHarbour, "21"), "Harbour/Lantern · Transform (21)");
    EXPECT_EQ(NameOf(kHarbour, "23"), "Harbour/Lantern · Light 2 (23)");
    EXPECT_EQ(NameOf(kHarbour, "24"), "Harbour/Lantern · MonoBehaviour 4f0c2b7d (24)");
}

TEST(ObjectNames, PrefabInstancesAreNamedByAnOverrideOrTheirSource) {
    EXPECT_EQ(NameOf(kHarbour, "40"), "Harbour/Boat (40)");
    EXPECT_EQ(NameOf(kHarbour, "41"), "Harbour/Boat · Transform (41)");
    EXPECT_EQ(NameOf(kHarbour, "50"), "Harbour/Boat/PrefabInstance c5a81f3e (50)");
}

TEST(ObjectNames, OthersAreNamedByClassAndName) {
    EXPECT_EQ(NameOf(kHarbour, "60"), "Material Rust (60)");
    EXPECT_EQ(NameOf(kHarbour, "61"), "RenderSettings (61)");
    EXPECT_EQ(NameOf(kHarbour, "99"), "(missing 99)");
}

} // namespace
