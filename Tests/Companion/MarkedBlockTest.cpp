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
