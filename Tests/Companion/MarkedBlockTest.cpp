#include "Setup/MarkedBlock.h"

#include "Words/Failure.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin;

constexpr const char* kLines = "*.ovrin merge=ovrin\n*.meta merge=ovrin\n";
const std::string kTexts[] = {
    "", "a\n", "a", "a\r\nb\r\n", "a\nb", "\n\n\n", "# comment\n", "a\r\nb\n", std::string("a\0b\n", 4)};

MarkedBlock BlockOf(const std::string& text) {
    const auto block = FindBlock(text, "file");
    EXPECT_TRUE(block);
    return block.value_or(MarkedBlock{});
}

TEST(MarkedBlock, WhatIsAddedAndRemovedLeavesEveryByte) {
    for (const std::string& text : kTexts)
        for (const FirstMark mark : {FirstMark::OnItsOwnLine, FirstMark::BehindTheFirstLine}) {
            const std::string with = AddBlock(text, text.size(), kLines, {}, mark);
            const MarkedBlock block = BlockOf(with);
            EXPECT_TRUE(block.isUnchanged) << with;
            EXPECT_EQ(RemoveBlock(with, block), text);
        }
}

TEST(MarkedBlock, OtherLinesTakeThePlaceAndTheOriginStays) {
    for (const std::string& text : kTexts) {
        const std::string first = AddBlock(text, text.size(), kLines, {}, FirstMark::OnItsOwnLine);
        const std::string second = ReplaceBlock(first, BlockOf(first), "other\n", FirstMark::OnItsOwnLine);
        EXPECT_TRUE(BlockOf(second).isUnchanged) << second;
        EXPECT_EQ(RemoveBlock(second, BlockOf(second)), text);
    }
}

/// All texts of up to six of the letters that line ends are made of.
TEST(MarkedBlock, LineEndsOfEveryKindComeBack) {
    std::vector<std::string> texts = {""};
    for (std::size_t i = 0; i < texts.size(); ++i) {
        const std::string text = texts[i];
        if (text.size() < 6)
            for (const char letter : {'a', '\r', '\n'}) texts.push_back(text + letter);
        std::string with = AddBlock(text, text.size(), kLines, {}, FirstMark::OnItsOwnLine);
        EXPECT_EQ(RemoveBlock(with, BlockOf(with)), text) << testing::PrintToString(text);
        with = ReplaceBlock(with, BlockOf(with), "other\n", FirstMark::BehindTheFirstLine);
        EXPECT_TRUE(BlockOf(with).isUnchanged);
        EXPECT_EQ(RemoveBlock(with, BlockOf(with)), text) << testing::PrintToString(text);
    }
}

TEST(MarkedBlock, LinesInFrontStayWhereTheyAre) {
    const std::string text = "#!/bin/sh\necho a\n";
    const std::string with = AddBlock(text, 10, kLines, {}, FirstMark::OnItsOwnLine);
    EXPECT_EQ(BlockOf(with).begin, 10u);
    EXPECT_EQ(BlockOf(with).lines, kLines);
    EXPECT_EQ(RemoveBlock(with, BlockOf(with), "kept\n"), "#!/bin/sh\nkept\necho a\n");
}

TEST(MarkedBlock, OriginIsReadAsItWasWritten) {
    for (const unsigned folders : {0u, 1u, 7u})
        for (const bool madeFile : {false, true}) {
            const BlockOrigin origin =
                BlockOf(MarkLines(kLines, {madeFile, folders, true}, FirstMark::OnItsOwnLine)).origin;
            EXPECT_EQ(origin.madeFile, madeFile);
            EXPECT_EQ(origin.madeFolders, folders);
            EXPECT_TRUE(origin.hadNoLineEnd);
        }
}

TEST(MarkedBlock, EditorMayChangeAllLineEnds) {
    std::string changed;
    for (const char letter : AddBlock("a\n", 2, kLines, {}, FirstMark::OnItsOwnLine))
        changed += letter == '\n' ? "\r\n" : std::string(1, letter);
    EXPECT_TRUE(BlockOf(changed).isUnchanged);
    EXPECT_EQ(RemoveBlock(changed, BlockOf(changed)), "a\r\n");
}

TEST(MarkedBlock, ChangedLinesAreNoticed) {
    std::string text = AddBlock("a\n", 2, kLines, {}, FirstMark::OnItsOwnLine);
    text.replace(text.find("*.meta"), 6, "*.mata");
    EXPECT_FALSE(BlockOf(text).isUnchanged);
}

TEST(MarkedBlock, TornOneIsAFailureAndNoneIsNone) {
    const std::string text = AddBlock("a\n", 2, kLines, {}, FirstMark::OnItsOwnLine);
    EXPECT_THROW(FindBlock(text.substr(0, text.rfind("# <<<")), "file"), Failure);
    EXPECT_FALSE(FindBlock("a\n", "file"));
}

} // namespace
