#include "Repair/ComponentDependencies.h"

#include "Support/ObjectText.h"

#include <gtest/gtest.h>

using namespace object_text;

namespace {

/// 500 is an engine, 501 needs one, 502 is derived from one, 503 needs itself.
const char* const kTypes =
    "1 &1 MergeTypeInfo: ["
    "{id: 500, name: Engine, ismulti: 0, baseid: 2, requires: '', conflicts: ''}, "
    "{id: 501, name: Wheel, ismulti: 0, baseid: 2, requires: f4010000, conflicts: ''}, "
    "{id: 502, name: Turbine, ismulti: 0, baseid: 500, requires: '', conflicts: ''}, "
    "{id: 503, name: Self, ismulti: 0, baseid: 2, requires: f7010000, conflicts: ''}]\n";

std::string Show(const YAMLScalar* id) {
    return id ? std::string(id->Value()) : "-";
}

/// The conflicts as "left right SIDE-THAT-REMOVED; ".
std::string Conflicts(Scene merged, Scene left, Scene right, const char* types = kTypes) {
    YAMLTypeInfoManager manager;
    if (types) manager.Read(Scene(types).Objects());
    std::string text;
    for (const auto& conflict :
         FindComponentDependencyConflicts(merged.Root(), left.Root(), right.Root(), manager))
        text += Show(conflict.leftComponent) + " " + Show(conflict.rightComponent) + " " +
                (conflict.conflictType == ConflictLeftRemoves ? "left; " : "right; ");
    return text;
}

/// A GameObject 10 with one component for each class id, with the ids 100 + class id.
std::string GameObject(const std::vector<int>& classes) {
    std::string list, components;
    for (const int classID : classes) {
        const std::string id = std::to_string(100 + classID);
        list += (list.empty() ? "" : ", ") + ("{component: {fileID: " + id + "}}");
        components += std::to_string(classID) + " &" + id + " C: {m_GameObject: {fileID: 10}}\n";
    }
    return "1 &10 GameObject: {m_Component: [" + list + "]}\n" + components;
}

TEST(ComponentDependencies, RemovalOfWhatAnotherComponentNeedsIsAConflict) {
    EXPECT_EQ(Conflicts(GameObject({501}), GameObject({}), GameObject({500, 501})), "- 600 left; ");
    EXPECT_EQ(Conflicts(GameObject({501}), GameObject({500, 501}), GameObject({})), "600 - right; ");
    EXPECT_EQ(Conflicts(GameObject({501}), GameObject({501}), ""), "- - left; ");
    EXPECT_EQ(Conflicts(GameObject({501}), GameObject({502}), "1 &10 C: {}\n"), "602 - right; ");
}

TEST(ComponentDependencies, NeedIsMetByTheClassOrADerivedOneBesideIt) {
    for (const std::vector<int>& classes : {std::vector{501, 500}, {502, 501}, {503}, {500}, {999}})
        EXPECT_EQ(Conflicts(GameObject(classes), GameObject({500}), GameObject({500})), "");
    EXPECT_EQ(Conflicts(GameObject({501, 999}), "", ""), "- - left; ");
}

TEST(ComponentDependencies, MissingGameObjectsAreToldOnceInDocumentOrder) {
    const auto component = [](int id, const char* object) {
        return "500 &" + std::to_string(id) + " C: {m_GameObject: {fileID: " + object + "}}\n";
    };
    const std::string merged =
        component(1, "20") + component(2, "0") + component(3, "10") + component(4, "20");
    EXPECT_EQ(Conflicts(merged, "1 &20 GameObject: {}\n", "1 &10 GameObject: {}\n"),
              "20 - right; - 0 left; - 10 left; ");
    EXPECT_EQ(Conflicts(component(3, "10") + "1 &10 GameObject: x\n", "", ""), "");
}

TEST(ComponentDependencies, OddShapesTakeNoPart) {
    const std::string odd =
        "1 &10 GameObject: {m_Component: x}\n"
        "1 &11 GameObject: {m_Component: [x, {}, {a: x}, {a: {fileID: []}}, {a: {fileID: 9}}]}\n"
        "1 &12 {}\n501 &13 Wheel: {}\n501 &14 Wheel: {m_GameObject: x}\n"
        "501 &15 Wheel: {m_GameObject: {fileID: {}}}\n";
    EXPECT_EQ(Conflicts(odd, odd, odd), "");
}

TEST(ComponentDependencies, WithoutTypeInformationNothingIsLookedAt) {
    EXPECT_EQ(Conflicts("500 &1 C: {m_GameObject: {fileID: 0}}\n", "", "", nullptr), "");
}

} // namespace
