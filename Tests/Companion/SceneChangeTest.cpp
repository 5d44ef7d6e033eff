#include "Changes/FileChange.h"

#include "Changes/ChangeMarkdown.h"
#include "Changes/ChangeText.h"
#include "Changes/ListMoves.h"
#include "Words/Markdown.h"

#include "Support/ObjectText.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin;
using object_text::Scene;

FileVersion Version(const std::string& text) {
    if (text.empty()) return nullptr;
    return [text](const IsWanted& isWanted) -> std::optional<std::string> {
        if (!isWanted(text)) return std::nullopt;
        return text;
    };
}

/// A file of these objects; other texts as they are.
std::string File(const std::string& lines) {
    if (lines.starts_with('%') || lines.find('&') == std::string::npos) return lines;
    Scene scene(lines);
    std::ostringstream stream;
    Output(scene.Objects(), stream);
    return stream.str();
}

FileChange Compare(const std::string& before, const std::string& after, const std::string& path = "a.ovrin") {
    const FileStatus status = before.empty()  ? FileStatus::Added
                              : after.empty() ? FileStatus::Removed
                                              : FileStatus::Changed;
    return CompareFile({{status, path, path}, Version(File(before)), Version(File(after))}, {}, {});
}

/// What is told, without the line of the file.
std::string Told(const std::string& before, const std::string& after) {
    const std::string text = ChangeText(Compare(before, after), false);
    return text.substr(text.find('\n') + 1);
}

/// Two GameObjects, the second of that name, parent and layer.
std::string Harbour(const std::string& name, const std::string& father, const std::string& layer) {
    const std::string child = "{fileID: 4}";
    return "1 &1 GameObject: {m_Component: [{component: {fileID: 2}}], m_Name: Harbour}\n"
           "4 &2 Transform: {m_GameObject: {fileID: 1}, m_Children: [" +
           (father == "2" ? child : "") +
           "], m_Father: {fileID: 0}}\n"
           "1 &3 GameObject: {m_Component: [{component: {fileID: 4}}], m_Name: " +
           name + ", m_Layer: " + layer +
           "}\n"
           "4 &4 Transform: {m_GameObject: {fileID: 3}, m_Father: {fileID: " +
           father + "}}\n";
}

TEST(SceneChange, ValuesAreToldOldToNew) {
    EXPECT_EQ(Told(Harbour("Boat", "2", "0"), Harbour("Ship", "2", "3")), "  changed  Harbour/Ship (3)\n"
                                                                          "             m_Name: Boat → Ship\n"
                                                                          "             m_Layer: 0 → 3\n");
}

TEST(SceneChange, AMoveIsToldOfTheObjectAndNotOfItsParents) {
    EXPECT_EQ(Told(Harbour("Boat", "2", "0"), Harbour("Boat", "0", "0")),
              "  moved    Boat (3), from Harbour\n");
    EXPECT_EQ(Told(Harbour("Boat", "0", "0"), Harbour("Boat", "2", "1")),
              "  changed  Harbour/Boat (3), moved from the top\n             m_Layer: 0 → 1\n");
}

TEST(SceneChange, WhatListsOfParentsGainOrLoseIsToldOnce) {
    const std::string all = Harbour("Boat", "2", "0");
    const std::string without = Harbour("Boat", "0", "0");
    EXPECT_EQ(Told(all, without.substr(0, without.find("1 &3"))),
              "  removed  Harbour/Boat (3)\n  removed  Harbour/Boat · Transform (4)\n");
    // A child that stays is gone from the list.
    std::string orphaned = all;
    orphaned.replace(orphaned.find("[{fileID: 4}]"), 13, "[]");
    EXPECT_EQ(Told(all, orphaned),
              "  changed  Harbour · Transform (2)\n"
              "             m_Children[Harbour/Boat]: removed Harbour/Boat · Transform (4)\n");
}

TEST(SceneChange, ListsTellWhatCameWentAndMoved) {
    EXPECT_EQ(Told("114 &1 MonoBehaviour: {l: [{fileID: 5, v: 1}, {fileID: 6}, {fileID: 7}]}\n",
                   "114 &1 MonoBehaviour: {l: [{fileID: 7}, {fileID: 5, v: 2}, {fileID: 8}]}\n"),
              "  changed  MonoBehaviour (1)\n"
              "             l[(missing 6)]: removed (missing 6)\n"
              "             l[(missing 5)]: moved from index 0 to 1\n"
              "             l[(missing 5)].v: 1 → 2\n"
              "             l[(missing 8)]: added (missing 8)\n");
    EXPECT_EQ(FindMoved({3, 0, -1, 1, 2}), std::vector<std::size_t>{0});
    EXPECT_EQ(FindMoved({}), std::vector<std::size_t>{});
}

TEST(SceneChange, OtherOrderAndFormAreNoSilence) {
    EXPECT_EQ(
        Told("114 &1 MonoBehaviour: {a: 1, b: 2}\n", "114 &1 MonoBehaviour: {b: 3, a: 1}\n"),
        "  changed  MonoBehaviour (1)\n             b: 2 → 3\n             (order of the fields): changed\n");
    EXPECT_EQ(Told("1 &1 A: {}\n2 &2 B: {}\n", "2 &2 B: {}\n1 &1 A: {}\n"), "  no object differs\n");
}

TEST(SceneChange, VersionsThatArentThereHaveNoObjects) {
    const FileChange added = Compare("", Harbour("Boat", "2", "0")),
                     removed = Compare(Harbour("Boat", "2", "0"), "");
    ASSERT_TRUE(added.scene && removed.scene);
    EXPECT_EQ(added.scene->added + removed.scene->removed, 8u);
}

TEST(SceneChange, WhatIsNoSceneIsTold) {
    EXPECT_EQ(Compare("text", "other", "a.txt").reason, "");
    EXPECT_FALSE(Compare("text", "other", "a.txt").scene);
    EXPECT_NE(Compare("text", Harbour("Boat", "2", "0"), "a.txt").reason, "");
    EXPECT_NE(Compare("<<<<<<< a\n=======\n>>>>>>> b\n", Harbour("Boat", "2", "0")).reason, "");
    EXPECT_NE(
        Compare(File(Harbour("Boat", "2", "0")) + "--- !o!1 &9\na: [\n", Harbour("Boat", "2", "0")).reason,
        "");
}

TEST(SceneChange, NothingInMarkdownIsMarkup) {
    EXPECT_EQ(CodeSpan("@all #1 <b>*a*"), "`@all #1 <b>*a*`");
    EXPECT_EQ(CodeSpan("a``b`"), "``` a``b` ```");
    const FileChange change = Compare(Harbour("Boat", "2", "0"), Harbour("'`@you`'", "2", "0"), "x`y.ovrin");
    EXPECT_EQ(ChangeMarkdown(std::span(&change, 1)), "### ``x`y.ovrin``\n\n"
                                                     "- **changed** ``Harbour/`@you` (3)``\n"
                                                     "  - `m_Name`: `Boat` → `` `@you` ``\n\n");
}

} // namespace
