#include "Names/ObjectNames.h"

#include "Names/HierarchyOrder.h"
#include "Names/MergeNames.h"
#include "Names/PrintableText.h"

#include "Support/ObjectText.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin;
using object_text::Id;
using object_text::Scene;
using ovrin_yaml::YAMLScalar;

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

TEST(ObjectNames, DamagedObjectsHaveNamesToo) {
    const char* const scene = R"(
1 &1 GameObject: {m_Component: [{component: {fileID: 2}}, x, {fileID: 8}], m_Name: " "}
4 &2 Transform: {m_GameObject: {fileID: 1}, m_Father: {fileID: 99}}
1 &3 GameObject: {m_Component: {component: {fileID: 1}}, m_Name: [a]}
4 &4 Transform: {m_GameObject: {fileID: 98}, m_Father: 7}
23 &5 MeshRenderer: scalar
1 &6 GameObject: {m_Name: a, m_Name: b, m_Component: [{component: {fileID: 7}}]}
4 &7 Transform: {m_Father: {fileID: 4}, m_GameObject: {fileID: 5}}
4 &8 stripped Transform: {}
)";
    EXPECT_EQ(NameOf(scene, "1"), "(missing 99)/(no name) (1)");
    EXPECT_EQ(NameOf(scene, "3"), "(no name) (3)");
    EXPECT_EQ(NameOf(scene, "4"), "(missing 98) · Transform (4)");
    EXPECT_EQ(NameOf(scene, "5"), "MeshRenderer (5)");
    EXPECT_EQ(NameOf(scene, "6"), "(missing 4)/a (6)");
    EXPECT_EQ(NameOf(scene, "7"), "MeshRenderer · Transform (7)");
    EXPECT_EQ(NameOf(scene, "8"), "Transform (8)");
}

TEST(ObjectNames, ALoopHasTheSameNamesWhereverOneBegins) {
    const std::string scene = R"(
1 &1 GameObject: {m_Component: [{component: {fileID: 2}}], m_Name: A}
4 &2 Transform: {m_GameObject: {fileID: 1}, m_Father: {fileID: 4}}
1 &3 GameObject: {m_Component: [{component: {fileID: 4}}], m_Name: B}
4 &4 Transform: {m_GameObject: {fileID: 3}, m_Father: {fileID: 2}}
1 &5 GameObject: {m_Component: [{component: {fileID: 6}}], m_Name: C}
4 &6 Transform: {m_GameObject: {fileID: 5}, m_Father: {fileID: 4}}
)";
    for (const auto& order : {std::array{"1", "3", "5"}, std::array{"5", "3", "1"}}) {
        Scene file(scene);
        const ObjectNames names(file.Root());
        for (const char* id : order) names.Name(Id(id));
        EXPECT_EQ(names.Name(Id("1")), "(loop)/A");
        EXPECT_EQ(names.Name(Id("3")), "(loop)/B");
        EXPECT_EQ(names.Name(Id("5")), "(loop)/B/C");
    }
}

TEST(ObjectNames, NothingOfANameReachesATerminalAsMoreThanText) {
    Scene scene("1 &1 GameObject: {m_Name: \"\\e[2Ja\\nb\\u202ec\\x85\"}\n");
    EXPECT_EQ(ObjectNames(scene.Root()).Name(Id("1")), "\\x1b[2Ja\\nb\\u202ec\\u0085");
    EXPECT_EQ(Printable("a\xff\xc3("), "a\\xff\\xc3(");
    EXPECT_EQ(Printable("Hafen – Träger 港"), "Hafen – Träger 港");
    EXPECT_EQ(PrintableLines("a\x1b:\n\tb\n"), "a\\x1b:\n\tb\n");
}

TEST(ObjectNames, LongWaysAreShortenedInTheMiddle) {
    std::string lines;
    const auto text = [](int number) { return std::to_string(number); };
    for (int i = 0; i < 20000; ++i)
        lines += "1 &" + text(2 * i + 1) +
                 " GameObject: {m_Component: [{component: {fileID: " + text(2 * i + 2) + "}}], m_Name: o" +
                 text(i) + "}\n4 &" + text(2 * i + 2) +
                 " Transform: {m_GameObject: {fileID: " + text(2 * i + 1) +
                 "}, m_Father: {fileID: " + text(2 * i) + "}}\n";
    Scene scene(lines);
    const ObjectNames names(scene.Root());
    EXPECT_EQ(names.Name(Id("39999")).substr(0, 27), "o0/o1/o2/o3/…/o19984/o199");
    EXPECT_TRUE(names.Name(Id("39999")).ends_with("/o19998/o19999"));
    EXPECT_EQ(names.Name(Id("39")).size(), std::string("o0/o1/o2/o3/o4/o5/o6/o7/o8/o9").size() + 40);
}

TEST(HierarchyRanks, FollowTheHierarchy) {
    Scene scene(kHarbour);
    const ObjectNames names(scene.Root());
    const ObjectNames* const trees[] = {&names};
    std::vector<std::string> ids = {"99", "61", "24", "22", "21", "20", "50", "41", "40", "11", "10"};
    std::vector<const YAMLScalar*> scalars;
    for (const std::string& id : ids) scalars.push_back(Id(id));
    const std::vector<std::uint32_t> ranks = HierarchyRanks(trees, scalars);
    std::vector<std::string> sorted(ids.size());
    for (std::size_t i = 0; i < ids.size(); ++i) sorted[ranks[i]] = ids[i];
    EXPECT_EQ(sorted,
              (std::vector<std::string>{"10", "11", "40", "41", "50", "20", "21", "22", "24", "61", "99"}));
}

TEST(MergeNames, VersionsThatDifferAreTold) {
    Scene base("1 &1 GameObject: {m_Name: Lantern}\n1 &2 GameObject: {m_Name: Gate}\n"), ours(base.Text()),
        theirs("1 &1 GameObject: {m_Name: Lamp}\n1 &3 GameObject: {m_Name: New}\n");
    const MergeNames names(base.Root(), ours.Root(), theirs.Root());
    EXPECT_EQ(names.Name(Id("1")), "Lantern (theirs: Lamp)");
    EXPECT_EQ(names.NameWithID(Id("1")), "Lantern (1, theirs: Lamp)");
    EXPECT_EQ(names.Name(Id("2")) + names.Name(Id("3")) + names.Name(Id("4")), "GateNew(missing 4)");
    const MergeNames swapped(base.Root(), theirs.Root(), ours.Root(), {"base", "main", "work"});
    EXPECT_EQ(swapped.Name(Id("1")), "Lamp (base and work: Lantern)");
}

} // namespace
