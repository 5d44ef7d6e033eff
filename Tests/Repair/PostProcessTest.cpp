#include "Repair/PostProcess.h"

#include "Session/Tasks.h"
#include "Support/ObjectText.h"

#include <gtest/gtest.h>

using namespace object_text;

namespace {

/// The merged file behind the repair, or what failed.
std::string Repaired(const std::string& merged, const std::string& left = "", const std::string& right = "",
                     const TaskRunner& run = {}) {
    Scene m(merged), l(left), r(right);
    const std::string failure = ErrorOf([&] {
        const MergeRules rules;
        RecordingConflictResolver resolver(rules, ResolveBase);
        PostProcessMergeOnly({m.Root(), l.Root(), r.Root(), run}, resolver);
    });
    return failure == "none" ? m.Text() : failure;
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
              "Cannot perform this operation on a YAML file with duplicate keys");
}

TEST(PostProcess, SidesStayAsTheyAre) {
    const std::string side = Linked("9") + "1107 &3 AnimatorStateMachine: {m_StateMachineTransitions: []}\n";
    Scene merged(side), left(side + kPrefab), right(side);
    const MergeRules rules;
    RecordingConflictResolver resolver(rules, ResolveBase);
    EXPECT_FALSE(PostProcess({merged.Root(), left.Root(), right.Root()}, {}, resolver));
    EXPECT_EQ(left.Text(), side + kPrefab);
    EXPECT_EQ(right.Text(), side);
    EXPECT_EQ(merged.Text(), "1107 &3 AnimatorStateMachine: {m_StateMachineTransitions: {}}\n");
}

/// So many objects that they are looked at on several threads, with each of `lines` among them.
std::string AmongMany(const std::vector<std::string>& lines) {
    constexpr std::size_t kCount = 36'000;
    std::string text;
    for (std::size_t i = 0; i < kCount; ++i) {
        if (i % (kCount / lines.size()) == 11) text += lines[i / (kCount / lines.size())];
        text += "4 &" + std::to_string(100'000 + i) + " Transform: {m_Father: {fileID: 0}}\n";
    }
    return text;
}

TEST(PostProcess, ManyObjectsAreRepairedAsFewAre) {
    const auto transform = [](const char* start, const std::string& fields) {
        return std::string(start) + " Transform: {" + fields + "}\n";
    };
    const std::string father = "m_Father: {fileID: 9}", link = "m_PrefabInternal: {fileID: 9}";
    const std::string merged = AmongMany(
        {transform("4 &7", father), Linked("9", "2"), transform("4 &3 stripped", link + ", " + father),
         "114 &4 C: {l: [{m: {" + link + "}}]}\n", kGameObject, transform("4 &5", father),
         "1107 &6 AnimatorStateMachine: {m_StateMachineTransitions: [{a: 1}, {a: 2}]}\n"});
    EXPECT_TRUE(Repaired(merged, kPrefab, "", RunnerFor(Threads::Everywhere)) == Repaired(merged, kPrefab));
    EXPECT_FALSE(Repaired(merged, kPrefab) == merged);
}

TEST(PostProcess, OfManyObjectsTheFirstThatFailsIsTold) {
    const std::string repeated = "114 &1 C: {l: [{m: {k: 1, k: 2}}]}\n";
    const std::string stripped = "4 &2 stripped Transform: {}\n";
    const std::vector<std::string> orders[] = {{stripped, repeated}, {repeated, stripped}};
    for (const auto& lines : orders) {
        const std::string merged = AmongMany(lines);
        const std::string failure = Repaired(merged);
        EXPECT_LT(failure.size(), 100u) << "it fails";
        EXPECT_EQ(Repaired(merged, "", "", RunnerFor(Threads::Everywhere)), failure);
    }
}

} // namespace
