#include "Repair/FileIDCollisions.h"

#include "Support/ObjectText.h"
#include "Values/YAMLSequence.h"

#include <gtest/gtest.h>

using namespace object_text;

namespace {

/// The right file behind the remap, or what failed.
std::string Remapped(Scene&& base, Scene&& left, Scene&& right) {
    const auto conflicts = CreateConflictingFileIDsRemapper(base.Root(), left.Root(), right.Root());
    const std::string failure =
        ErrorOf([&] { RemapCollidingAddFileIDs(conflicts, base.Root(), left.Root(), right.Root()); });
    return failure == "none" ? right.Text() : failure;
}

/// The hashes of a tree, parents in front of their children.
std::string Hashes(const YAMLNode& node) {
    std::string text = std::to_string(node.m_Hash) + " ";
    if (const YAMLMapping* mapping = AsMapping(&node))
        for (const auto& entry : *mapping)
            if (!IsPlaceHolderKey(entry.key)) text += Hashes(*entry.value);
    if (const YAMLSequence* sequence = AsSequence(&node))
        for (const YAMLNode* item : sequence->m_Items) text += Hashes(*item);
    return text;
}

/// Objects of the class B with the ids from `first` to `last`.
std::string Objects(int first, int last) {
    std::string lines;
    for (int id = first; id <= last; ++id) lines += "2 &" + std::to_string(id) + " B: {}\n";
    return lines;
}

TEST(FileIDCollisions, ConflictsAreAddedOnBothSidesAndSortedAsText) {
    Scene base("1 &5 A: {}"), left(Objects(5, 11)), right(Objects(5, 10));
    std::string ids;
    for (const YAMLScalar* id : CreateConflictingFileIDsRemapper(base.Root(), left.Root(), right.Root()))
        ids += std::string(id->Value()) + " ";
    EXPECT_EQ(ids, "10 6 7 8 9 ");
}

TEST(FileIDCollisions, RightObjectOfAnotherClassGetsTheNextFreeId) {
    EXPECT_EQ(Remapped("", "1 &5 A: {}\n", "2 &5 B: {}\n3 &9 C: {}\n"), "2 &6 B: {}\n3 &9 C: {}\n");
    EXPECT_EQ(Remapped("", "1 &5 A: {}\n", "1 &5 A: {a: 1}\n"), "1 &5 A: {a: 1}\n");
    EXPECT_EQ(Remapped("1 &5 A: {}\n", "1 &5 A: {}\n", "2 &5 B: {}\n"), "2 &5 B: {}\n");
}

TEST(FileIDCollisions, IdsOfAllFilesAndNewOnesAreTaken) {
    EXPECT_EQ(Remapped("1 &6 A: {}\n", "1 &5 A: {}\n1 &7 A: {}\n", "2 &5 B: {}\n2 &8 B: {}\n"),
              "2 &9 B: {}\n2 &8 B: {}\n");
    EXPECT_EQ(Remapped("", "1 &1000 A: {}\n1 &1001 A: {}\n", "2 &1000 B: {}\n2 &1001 B: {}\n"),
              "2 &1002 B: {}\n2 &1003 B: {}\n");
}

TEST(FileIDCollisions, ReferencesWithinTheRightFileFollow) {
    EXPECT_EQ(Remapped("", "1 &5 A: {}\n",
                       "2 &5 B: {self: {fileID: 5}, far: {fileID: 5, guid: abc}}\n"
                       "2 &8 B: {list: [{fileID: 5}, 5, [{r: {fileID: 5}}]], fileID: 5, other: 5}\n"
                       "2 &9 B: {fileID: [5], r: {fileID: 4}}\n"),
              "2 &6 B: {self: {fileID: 6}, far: {fileID: 5, guid: abc}}\n"
              "2 &8 B: {list: [{fileID: 6}, 5, [{r: {fileID: 6}}]], fileID: 6, other: 5}\n"
              "2 &9 B: {fileID: [5], r: {fileID: 4}}\n");
}

/// Else two additions that differ in nothing but the id would count as one.
TEST(FileIDCollisions, WhatHoldsAMovedIdHasTheHashOfBeingRead) {
    const auto objects = [](const char* id) {
        const std::string text = id;
        return "2 &" + text + " B: {l: [{fileID: " + text + "}, {r: [[{fileID: " + text +
               "}]]}], o: {a: 1}}\n" + "4 &8 stripped T: {f: {fileID: " + text + "}}\n";
    };
    Scene base(""), left("1 &5 A: {}\n"), right(objects("5")), wanted(objects("6"));
    RemapCollidingAddFileIDs({Id("5")}, base.Root(), left.Root(), right.Root());
    for (const auto& [id, object] : wanted.Root()) EXPECT_EQ(Hashes(*right.Root().Get(id)), Hashes(*object));
}

TEST(FileIDCollisions, ReferencesMoveOnceThoughIdsFollowEachOther) {
    EXPECT_EQ(
        Remapped("", "1 &1 A: {}\n1 &2 A: {}\n", "2 &1 B: {r: {fileID: 2}}\n2 &2 B: {r: {fileID: 1}}\n"),
        "2 &3 B: {r: {fileID: 4}}\n2 &4 B: {r: {fileID: 3}}\n");
}

TEST(FileIDCollisions, WithoutAFreeIdTheRightFileStaysAsItWas) {
    EXPECT_EQ(Remapped("", "1 &1000 A: {}\n" + Objects(1001, 1018), "2 &1000 B: {}\n"), "2 &1019 B: {}\n");
    const std::pair<const char*, std::string> kCases[] = {
        {"1000", Objects(1001, 1019)}, {"2147483647", ""}, {"2147483646", "2 &2147483647 B: {}\n"},
        {"99999999999", ""},           {"-5", ""},         {"0", ""},
    };
    for (const auto& [id, taken] : kCases) {
        Scene right("2 &1 B: {}\n2 &" + std::string(id) + " B: {}\n");
        const std::string before = right.Text();
        EXPECT_EQ(Remapped("", "1 &1 A: {}\n1 &" + std::string(id) + " A: {}\n" + taken, std::move(right)),
                  "Cannot create new fileID for conflicting fileID: " + std::string(id));
        EXPECT_EQ(right.Text(), before);
    }
}

} // namespace
