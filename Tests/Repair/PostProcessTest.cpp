#include "Repair/PostProcess.h"

#include "Support/ObjectText.h"

#include <gtest/gtest.h>

using namespace object_text;

namespace {

/// The merged file behind the repair, or what failed.
std::string Repaired(const std::string& merged, const std::string& left = "", const std::string& right = "") {
    Scene m(merged), l(left), r(right);
    const std::string failure = FailureOf([&] {
        const MergeRules rules;
        RecordingConflictResolver resolver(rules, ResolveBase);
        PostProcessMergeOnly(m.Root(), l.Root(), r.Root(), resolver);
    });
    return failure.empty() ? m.Text() : failure;
}

std::string Linked(const std::string& prefab, const std::string& gameObject = "0") {
    return "4 &1 Transform: {m_Father: {fileID: 0}, m_PrefabInternal: {fileID: " + prefab +
           "}, m_GameObject: {fileID: " + gameObject + "}}\n";
}

const std::string kGameObject = "1 &2 GameObject: {}\n";
const std::string kPrefab = "1001 &9 Prefab: {}\n";

TEST(PostProcess, LinkToARemovedPrefabIsCutWhereTheGameObjectIsThere) {
    EXPECT_EQ(Repaired(Linked("9", "2") + kGameObject, kPrefab), Linked("0", "2") + kGameObject);
    EXPECT_EQ(Repaired(Linked("9", "2") + kGameObject, "", kPrefab), Linked("0", "2") + kGameObject);
    EXPECT_EQ(Repaired(Linked("9", "2") + kPrefab, kPrefab), Linked("9", "2") + kPrefab);
}

TEST(PostProcess, TransformGoesWithItsRemovedPrefabWhereTheGameObjectIsGone) {
    for (const char* gameObject : {"2", "0", "''", "{}"})
        EXPECT_EQ(Repaired(Linked("9", gameObject), kPrefab), "") << gameObject;
}

TEST(PostProcess, LinkToNothingIsCutInAnyClassAndAtAnyDepth) {
    EXPECT_EQ(Repaired(Linked("9")), Linked("0"));
    EXPECT_EQ(Repaired("114 &1 C: {l: [{m: {m_PrefabInternal: {fileID: 9, x: 1}}}], m_PrefabInternal: 9}\n"),
              "114 &1 C: {l: [{m: {m_PrefabInternal: {fileID: 0, x: 1}}}], m_PrefabInternal: 9}\n");
    EXPECT_EQ(Repaired("114 &1 C: {m_PrefabInternal: [{fileID: 9}], a: {fileID: 9}}\n"),
              "114 &1 C: {m_PrefabInternal: [{fileID: 9}], a: {fileID: 9}}\n");
}

TEST(PostProcess, OnlyAStrippedTransformGoesForALinkToNothing) {
    const std::string fields = "{m_PrefabInternal: {fileID: 9}, m: {m_PrefabInternal: {fileID: 9}}}\n";
    const std::string cut = "{m_PrefabInternal: {fileID: 0}, m: {m_PrefabInternal: {fileID: 0}}}\n";
    EXPECT_EQ(Repaired("4 &1 stripped Transform: " + fields + "224 &2 stripped RectTransform: " + fields),
              "");
    EXPECT_EQ(Repaired("4 &1 Transform: " + fields), "4 &1 Transform: " + cut);
    EXPECT_EQ(Repaired("114 &1 stripped C: " + fields), "114 &1 stripped C: " + cut);
}

TEST(PostProcess, LinkToAPlaceHolderThatGoesStays) {
    EXPECT_EQ(Repaired("4 &1 stripped Transform: {m_PrefabInternal: {fileID: 9}}\n"
                       "114 &2 C: {m_PrefabInternal: {fileID: 1}}\n"),
              "114 &2 C: {m_PrefabInternal: {fileID: 1}}\n");
}

TEST(PostProcess, RepeatedKeysAnywhereAreNoticed) {
    EXPECT_EQ(Repaired("114 &1 C: {l: [{m: {k: 1, k: 2}}]}\n"),
              "YAMLError: Cannot perform this operation on a YAML file with duplicate keys");
}

TEST(PostProcess, SidesStayAsTheyAre) {
    const std::string side = Linked("9") + "1107 &3 AnimatorStateMachine: {m_StateMachineTransitions: []}\n";
    Scene merged(side), left(side + kPrefab), right(side);
    const MergeRules rules;
    RecordingConflictResolver resolver(rules, ResolveBase);
    EXPECT_FALSE(PostProcess(merged.Root(), left.Root(), right.Root(), {}, resolver));
    EXPECT_EQ(left.Text(), side + kPrefab);
    EXPECT_EQ(right.Text(), side);
    EXPECT_EQ(merged.Text(), "1107 &3 AnimatorStateMachine: {m_StateMachineTransitions: {}}\n");
}

} // namespace
