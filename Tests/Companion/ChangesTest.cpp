#include "Changes/ChangeJson.h"
#include "Changes/ChangeMarkdown.h"
#include "Changes/ChangeText.h"
#include "Changes/ListMoves.h"
#include "Names/PrintableText.h"

#include <algorithm>
#include <bit>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <numeric>
#include <random>
#include <set>

namespace {

using namespace ovrin;
using nlohmann::json;

bool IsAscending(const std::vector<int>& targets, unsigned leftOut) {
    int last = -1;
    for (std::size_t i = 0; i < targets.size(); ++i) {
        if (targets[i] < 0 || (leftOut >> i & 1)) continue;
        if (targets[i] < last) return false;
        last = targets[i];
    }
    return true;
}

/// The least number of elements to be left out, tried out.
int LeastMoves(const std::vector<int>& targets) {
    int least = static_cast<int>(targets.size());
    for (unsigned leftOut = 0; leftOut < 1u << targets.size(); ++leftOut)
        if (IsAscending(targets, leftOut)) least = std::min(least, std::popcount(leftOut));
    return least;
}

TEST(ListMoves, AreAsFewAsCanBeAndLeaveTheOthersInOrder) {
    std::mt19937 random(4);
    for (int round = 0; round < 300; ++round) {
        std::vector<int> targets(random() % 9);
        std::iota(targets.begin(), targets.end(), 0);
        std::shuffle(targets.begin(), targets.end(), random);
        for (int& target : targets)
            if (random() % 4 == 0) target = -1;
        unsigned moved = 0;
        for (const std::size_t index : FindMoved(targets)) moved |= 1u << index;
        EXPECT_TRUE(IsAscending(targets, moved)) << testing::PrintToString(targets);
        EXPECT_EQ(std::popcount(moved), LeastMoves(targets)) << testing::PrintToString(targets);
    }
}

FileChange Change(FileStatus status, const std::string& oldPath, const std::string& newPath) {
    return {.file = {status, oldPath, newPath}, .scene = {}, .reason = {}};
}

/// A scene in which everything is told that there is.
FileChange Everything(const std::string& text) {
    FileChange change = Change(FileStatus::Renamed, text + ".ovrin", text + text + ".ovrin");
    change.scene = SceneChange{};
    for (const ChangeKind kind :
         {ChangeKind::Added, ChangeKind::Removed, ChangeKind::Changed, ChangeKind::Moved}) {
        ObjectChange object{.id = "1", .name = text, .kind = kind, .formerParent = text, .properties = {}};
        object.isMoved = kind == ChangeKind::Moved;
        object.properties = {{text, kind, text, text}};
        change.scene->objects.push_back(object);
    }
    change.scene->added = change.scene->removed = change.scene->changed = change.scene->moved = 1;
    return change;
}

TEST(StatusText, TellsHowAFileCameAbout) {
    EXPECT_EQ(StatusText({FileStatus::Changed, "a", "a"}), "");
    EXPECT_EQ(StatusText({FileStatus::Renamed, "a\n", "b"}), "renamed from a\\n");
    std::set<std::string> texts;
    for (const FileStatus status : {FileStatus::Added, FileStatus::Removed, FileStatus::Renamed,
                                    FileStatus::Copied, FileStatus::Unmerged})
        texts.insert(StatusText({status, "a", "b"}));
    EXPECT_EQ(texts.size(), 5u);
    EXPECT_FALSE(texts.contains(""));
}

TEST(ChangeJson, IsValidWhateverTheBytesAndHasAllThatChanged) {
    for (const std::string text : {"a", "\"\\", "\xff\xfe", "\n\x1b", "Träger", ""}) {
        const FileChange change = Everything(text);
        const json file = json::parse(ChangeJson(std::span(&change, 1))).at("files").at(0);
        EXPECT_EQ(file.at("status"), "renamed");
        EXPECT_TRUE(file.at("isScene").get<bool>());
        std::vector<std::string> kinds;
        for (const json& object : file.at("objects")) kinds.push_back(object.at("change"));
        EXPECT_EQ(kinds, (std::vector<std::string>{"added", "removed", "changed", "moved"}));
        for (const char* count : {"added", "removed", "changed", "moved"}) EXPECT_EQ(file.at(count), 1);
    }
    EXPECT_EQ(json::parse(ChangeJson({})), json::parse("{\"files\": []}"));
}

TEST(ChangeText, NoNameOrPathReachesATerminalAsMoreThanText) {
    const FileChange change = Everything(Printable("\x1b[2J"));
    FileChange named = Change(FileStatus::Renamed, "\x1b[2J", "\r\n\xff");
    named.reason = "it can't be read";
    for (const FileChange& each : {change, named})
        for (const std::string& told : {ChangeText(each, false), ChangeStat(std::span(&each, 1), false),
                                        ChangeMarkdown(std::span(&each, 1))}) {
            EXPECT_EQ(told.find_first_of("\x1b\r\xff"), std::string::npos) << told;
            EXPECT_TRUE(told.ends_with('\n'));
        }
}

TEST(ChangeText, ColoursAreAllThatIsAdded) {
    const FileChange change = Everything("a");
    std::string coloured = ChangeText(change, true);
    EXPECT_NE(coloured, ChangeText(change, false));
    for (std::size_t begin; (begin = coloured.find('\x1b')) != std::string::npos;)
        coloured.erase(begin, coloured.find('m', begin) + 1 - begin);
    EXPECT_EQ(coloured, ChangeText(change, false));
    const std::string lines = "diff --git a/a b/a\n--- a/a\n+++ b/a\n@@ -1 +1 @@\n-1\n+2\n";
    EXPECT_EQ(PaintedLines(lines, false), lines);
}

TEST(ChangeStat, SumIsThatOfTheFiles) {
    const FileChange changes[] = {Everything("a"), Everything("b"),
                                  Change(FileStatus::Changed, "c.txt", "c.txt")};
    const std::string stat = ChangeStat(changes, false);
    EXPECT_NE(stat.find("aa.ovrin"), std::string::npos);
    EXPECT_NE(stat.find("2 scenes: 2 added, 2 removed, 2 changed, 2 moved"), std::string::npos) << stat;
}

} // namespace
