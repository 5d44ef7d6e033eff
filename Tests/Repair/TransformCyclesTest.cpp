#include "Repair/TransformCycles.h"
#include "Merge/RecordingConflictResolver.h"
#include "Support/ObjectText.h"

#include <gtest/gtest.h>

using namespace object_text;

namespace {

std::string Child(const std::string& id, const std::string& parent) {
    return "4 &" + id + " Transform: {m_Father: {fileID: " + parent + "}}\n";
}

/// A check of a merged file whose Transforms `touched` the merge has visited.
struct Check {
    Check(const std::string& merged, const std::vector<std::string>& touched, Scene left = "",
          MergeResolve byDefault = ResolveBase)
        : scene(merged), resolver(rules, byDefault) {
        for (const std::string& id : touched) {
            for (const YAMLScalar* key : {Id(id), Id("Transform"), Id("m_Father")}) resolver.PushPath(key);
            for (int i = 0; i < 3; ++i) resolver.PopPath();
        }
        Scene none("");
        failure = FailureOf([&] {
            CheckTransformHierarchy({scene.Root(), left.Root(), none.Root()}, resolver);
        });
        for (const auto& record : resolver.Records())
            cycles += std::string(record.path.Elements()[0]->Value()) + " ";
    }

    Scene scene;
    const MergeRules rules;
    RecordingConflictResolver resolver;
    std::string failure;
    std::string cycles; // the ids reported
};

/// Transforms `first` to `last`, each the child of the one before; the first has `parent`.
std::string Chain(int first, int last, const std::string& parent) {
    std::string lines = Child(std::to_string(first), parent);
    for (int id = first + 1; id <= last; ++id) lines += Child(std::to_string(id), std::to_string(id - 1));
    return lines;
}

TEST(TransformCycles, WhateverIsTouchedAndLeadsIntoALoopIsReported) {
    const std::string loop = Child("1", "2") + "224 &2 RectTransform: {m_Father: {fileID: 1}}\n";
    Check both(loop, {"2", "1"});
    EXPECT_EQ(both.cycles, "2 1 ");
    EXPECT_EQ(PathToString(both.resolver.Records()[0].path), "2.RectTransform.m_Father.fileID");
    EXPECT_TRUE(both.resolver.HasPendingConflicts());
    EXPECT_EQ(both.scene.Text(), loop);
    EXPECT_EQ(Check(loop, {}).cycles, "");
    EXPECT_EQ(Check(Child("1", "1"), {"1"}).cycles, "1 ");
    EXPECT_EQ(Check(Child("1", "2") + Child("2", "1") + Child("3", "1"), {"3"}).cycles, "3 ");
}

TEST(TransformCycles, AHundredAncestorsCountAsACycle) {
    EXPECT_EQ(Check(Chain(1, 100, "0"), {"100"}).cycles, "");
    EXPECT_EQ(Check(Chain(1, 101, "0"), {"101"}).cycles, "101 ");
    EXPECT_EQ(Check(Chain(1, 100, "''"), {"100"}).cycles, "");
}

TEST(TransformCycles, LongChainsAreNoMatterOfDepth) {
    const Check check(Chain(1, 100000, "0"), {"50", "100000"});
    EXPECT_EQ(check.failure + check.cycles, "100000 ");
}

TEST(TransformCycles, BlanksAreWrittenIntoEveryReportedMember) {
    Check check(Child("1", "2") + Child("2", "1"), {"1", "2"}, "", ResolveBlank);
    EXPECT_EQ(check.cycles, "1 2 ");
    EXPECT_EQ(check.scene.Text(), "4 &1 Transform: {m_Father: {fileID: ''}}\n"
                                  "4 &2 Transform: {m_Father: {fileID: ''}}\n");
}

TEST(TransformCycles, ParentOfAStrippedTransformStandsInItsPrefab) {
    for (const char* link : {"m_PrefabInstance", "m_PrefabInternal", "m_Prefab"})
        for (const char* classKey : {"Prefab", "PrefabInstance"}) {
            const std::string instance =
                "1001 &9 " + std::string(classKey) + ": {m_Modification: {m_TransformParent: {fileID: 2}}}\n";
            const std::string stripped =
                "4 &1 stripped Transform: {" + std::string(link) + ": {fileID: 9}}\n";
            EXPECT_EQ(Check(Child("2", "1") + stripped + instance, {"2"}).cycles, "2 ");
        }
}

TEST(TransformCycles, RemovedParentIsCutOff) {
    EXPECT_EQ(Check(Child("1", "2"), {}, Child("2", "0")).scene.Text(), Child("1", "0"));
    EXPECT_EQ(Check(Child("1", "2"), {}).scene.Text(), Child("1", "2"));
}

TEST(TransformCycles, ParentsOfOtherShapesAreNotKnown) {
    const Check check(
        "4 &1 Transform: {m_Father: x}\n4 &2 Transform: {m_Father: {guid: a}}\n"
        "4 &3 Transform: x\n4 &4 Transform: {m_Father: {fileID: []}}\n"
        "4 &5 stripped Transform: {m_Prefab: {fileID: 6}}\n1001 &6 Prefab: {m_Modification: x}\n"
        "4 &7 stripped Transform: {m_Prefab: {fileID: 99}}\n",
        {});
    EXPECT_EQ(check.failure, "");
}

TEST(TransformCycles, BrokenWalksFail) {
    const std::string unknown = "error: Cannot find transform parent for fileID";
    EXPECT_EQ(Check(Child("1", "2"), {"1"}, Child("2", "0")).failure, unknown);
    EXPECT_EQ(Check(Child("1", "2") + "1 &2 GameObject: {}\n", {"1"}).failure, unknown);
    EXPECT_EQ(Check("", {"1"}).failure,
              "error: Cannot find transform mapping from fileID while looking for cycles.");
    EXPECT_EQ(Check("4 &1 stripped Transform: {}\n", {}).failure,
              "YAMLError: Could not determine the transform parent of 1");
}

} // namespace
