#include "Settle/Terminal/KeyTable.h"
#include "Settle/Terminal/Letters.h"
#include "Settle/Terminal/StyledText.h"
#include "Settle/Terminal/TextDifference.h"
#include "Support/Surroundings.h"

#include <algorithm>
#include <clocale>
#include <gtest/gtest.h>
#include <random>
#include <set>

namespace {

using namespace ovrin;

struct TerminalTextTest : testing::Test {
    TerminalTextTest() { std::setlocale(LC_CTYPE, "C.UTF-8"); }
    ~TerminalTextTest() override { std::setlocale(LC_CTYPE, "C"); }

    const Letters letters = Letters(true), ascii = Letters(false);
};

/// The text with brackets around what the other lacks.
std::string Compared(const std::string& text, const std::string& other) {
    std::string marked = text;
    std::vector<TextRange> parts = PartsNotIn(text, other);
    for (auto part = parts.rbegin(); part != parts.rend(); ++part)
        marked.insert(part->end, "]").insert(part->begin, "[");
    return marked;
}

TEST_F(TerminalTextTest, WideCharactersTakeTwoColumnsAndMarksNone) {
    EXPECT_EQ(ColumnsOf("灯台 n\u0308"), 6);
    EXPECT_EQ(BytesWithin("灯台", 3), 3);
    EXPECT_EQ(BytesWithin("n\u0308x", 1), 3);
    EXPECT_EQ(EndWithin("Harbour/灯台", 4, letters), "…台");
    EXPECT_EQ(BeginningWithin("灯台灯台", 4, letters), "灯…");
    EXPECT_EQ(EndWithin("Harbour/Lantern", 9, ascii), "...antern");
}

TEST_F(TerminalTextTest, NothingHarmfulOrInvisibleReachesATerminal) {
    EXPECT_EQ(letters.Shown("a\x1b[2J\u200bb\xff\u0007"), "a\\x1b[2J\\u200bb\\xff\\x07");
    EXPECT_EQ(ascii.Shown("Hafen → ⚓ ä…"), "Hafen -> \\u2693 \\u00e4...");
    EXPECT_EQ(ascii.Shown("\U0001F6A2"), "\\U0001f6a2");
}

TEST_F(TerminalTextTest, LinesBreakBehindBlanksAndWithinWhatIsTooLong) {
    const auto wrapped = [](const StyledLine& line, std::size_t columns) {
        std::vector<std::string> texts;
        for (const StyledLine& part : Wrapped(line, columns)) texts.push_back(TextOf(part));
        return texts;
    };
    using Texts = std::vector<std::string>;
    EXPECT_EQ(wrapped({{"the "}, {"keeper lights it"}}, 10), (Texts{"the keeper", "lights it"}));
    EXPECT_EQ(wrapped({{"    abcdefgh"}}, 6), (Texts{"    ab", "cdefgh"}));
    EXPECT_EQ(wrapped({{"灯台灯"}}, 3), (Texts{"灯", "台", "灯"}));
    EXPECT_EQ(wrapped({{"灯"}}, 1), (Texts{"灯"}));
    EXPECT_EQ(wrapped({}, 5), (Texts{""}));
    EXPECT_EQ(TextOf(Fitted({{"灯台"}}, 3)), "灯 ");
}

TEST_F(TerminalTextTest, DifferencesAreToldByWords) {
    EXPECT_EQ(Compared("4.5", "4.25"), "[4.5]");
    EXPECT_EQ(Compared("lit at dusk", "lit at dawn"), "lit at [dusk]");
    EXPECT_EQ(Compared("{x: -1, y: 0}", "{x: 1, y: 0}"), "{x: [-1], y: 0}");
    EXPECT_EQ(Compared("a, b, c, d", "a, c, d"), "a, [b, ]c, d");
    EXPECT_EQ(Compared("new old man", "an older man"), "[new old] man");
    EXPECT_EQ(Compared("same", "same"), "same");
    EXPECT_EQ(Compared("all", ""), "[all]");
    EXPECT_EQ(Compared("", "all"), "");
}

TEST_F(TerminalTextTest, WhatIsNotMarkedStandsInTheOtherTextInThatOrder) {
    std::mt19937 random(7);
    const auto words = [&](std::size_t count, unsigned different) {
        std::string text;
        while (count-- > 0) text += std::string(1, static_cast<char>('a' + random() % different)) + "\n";
        return text;
    };
    for (const std::size_t count : {0, 1, 5, 30, 3000}) {
        const std::string text = words(count, 4), other = words(count, 4);
        std::string kept = text;
        const std::vector<TextRange> parts = PartsNotIn(text, other);
        for (auto part = parts.rbegin(); part != parts.rend(); ++part)
            kept.erase(part->begin, part->end - part->begin);
        std::erase(kept, '\n');
        std::size_t at = 0;
        for (const char letter : kept) {
            const std::size_t found = other.find(letter, at);
            ASSERT_NE(found, std::string::npos) << count;
            at = found + 1;
        }
    }
}

TEST_F(TerminalTextTest, EachKeyAsksForOneThingAndTheHelpTellsOfIt) {
    std::set<Key> keys;
    for (const KeyEntry& entry : KeyTable())
        for (const Key key : entry.keys) {
            EXPECT_TRUE(key == Key{} || keys.insert(key).second) << static_cast<unsigned>(key);
            EXPECT_TRUE(key == Key{} || RequestOf(key) == entry.request);
        }
    EXPECT_EQ(KeyLines(80, letters).size(), 2);
    for (const StyledLine& line : HelpLines(80, letters, false)) EXPECT_LE(ColumnsOf(line), 80);
}

/// A text of blanks, letters, wide characters and marks.
std::string RandomText(std::mt19937& random, std::size_t length) {
    constexpr const char* kParts[] = {"a", "b", " ", "灯", "n\u0308", "-", "\u0301", "  "};
    std::string text;
    while (length-- > 0) text += kParts[random() % std::size(kParts)];
    return text;
}

TEST_F(TerminalTextTest, NoTextIsEverWiderThanItsPlace) {
    std::mt19937 random(3);
    for (int round = 0; round < 3000; ++round) {
        const std::string text = letters.Shown(RandomText(random, random() % 20));
        const std::size_t columns = 1 + random() % 12, split = BytesWithin(text, random() % 12);
        EXPECT_LE(ColumnsOf(EndWithin(text, columns, letters)), columns) << text;
        EXPECT_LE(ColumnsOf(BeginningWithin(text, columns, letters)), columns) << text;
        EXPECT_EQ(ColumnsOf(text.substr(0, split)) + ColumnsOf(text.substr(split)), ColumnsOf(text));
        const StyledLine line = {{text.substr(0, split), Style::Strong}, {text.substr(split)}};
        EXPECT_EQ(ColumnsOf(Fitted(line, columns)), columns) << text;
        std::string wrapped;
        for (const StyledLine& part : Wrapped(line, columns)) {
            wrapped += TextOf(part);
            EXPECT_LE(ColumnsOf(part), std::max<std::size_t>(columns, 2)) << text;
        }
        std::string whole = text;
        EXPECT_EQ(std::erase(wrapped, ' ') <= std::erase(whole, ' '), true);
        EXPECT_EQ(wrapped, whole) << columns;
    }
}

TEST_F(TerminalTextTest, PartsAreOrderedAndWhatTheyLeaveIsInTheOtherText) {
    std::mt19937 random(5);
    for (int round = 0; round < 3000; ++round) {
        const std::string text = RandomText(random, random() % 12), other = RandomText(random, random() % 12);
        std::size_t at = 0;
        for (const TextRange& part : PartsNotIn(text, other)) {
            EXPECT_TRUE(part.begin >= at && part.begin < part.end && part.end <= text.size());
            at = part.end + 1; // those that touch are one
        }
        EXPECT_EQ(PartsNotIn(text, other).empty() && PartsNotIn(other, text).empty(), text == other)
            << text << "|" << other;
    }
}

TEST_F(TerminalTextTest, SignsAndPointsOfNumbersAreOfTheirWords) {
    EXPECT_EQ(Compared("-4.5", "4.5"), "[-4.5]");
    EXPECT_EQ(Compared("1.2.3", "1.2.4"), "[1.2.3]");
    EXPECT_EQ(Compared("end.", "end"), "end[.]");
    EXPECT_EQ(Compared(".", ""), "[.]");
    EXPECT_EQ(Compared("a - b", "a b"), "a [- ]b");
    EXPECT_EQ(Compared("one\ntwo", "one\nthree\ntwo"), "one\ntwo");
    EXPECT_EQ(Compared("灯台", "灯"), "[灯台]");
}

TEST_F(TerminalTextTest, LettersAreThoseOfTheEnvironment) {
    const surroundings::Variable character("LC_CTYPE", {}), language("LANG", {});
    for (const auto& [locale, isUTF8] : std::map<std::string, bool>{{"C", false},
                                                                    {"POSIX", false},
                                                                    {"", false},
                                                                    {"C.UTF-8", true},
                                                                    {"xx_XX.UTF-8", true},
                                                                    {"xx_XX.utf8", true},
                                                                    {"xx_XX.utf-8", true},
                                                                    {"xx_XX.UTF-8@euro", true},
                                                                    {"xx_XX.ISO-8859-1", false},
                                                                    {"xx", false}}) {
        const surroundings::Variable all("LC_ALL", locale);
        EXPECT_EQ(Letters::OfEnvironment().IsUTF8(), isUTF8) << locale;
        EXPECT_EQ(Letters::OfEnvironment().Shown("灯"), isUTF8 ? "灯" : "\\u706f") << locale;
    }
    const surroundings::Variable all("LC_ALL", {}), last("LANG", "xx_XX.UTF-8");
    EXPECT_TRUE(Letters::OfEnvironment().IsUTF8());
}

TEST_F(TerminalTextTest, SidesHaveTheLettersOfTheirNames) {
    for (const Side side : {Side::Base, Side::Ours, Side::Theirs}) {
        const Key key = KeyOf(LetterOf(side));
        EXPECT_EQ(SideOf(key), side);
        EXPECT_EQ(SideOf(RequestOf(key).value()), side);
        EXPECT_EQ(SideOf(static_cast<Key>(static_cast<unsigned>(key) - 'a' + 'A')), std::nullopt);
    }
    for (const Key key :
         {Key{}, Key::Unknown, Key::Redraw, KeyOf('0'), KeyOf('x'), static_cast<Key>(0x10FFFF)})
        EXPECT_FALSE(RequestOf(key) || SideOf(key));
    EXPECT_EQ(RequestOf(KeyOf('1')), Request::Remedy);
    for (const std::size_t columns : {1, 12, 13, 40}) {
        EXPECT_GE(HelpLines(columns, letters, true).size(), 10);
        for (const StyledLine& line : KeyLines(columns, ascii)) EXPECT_FALSE(line.empty());
    }
}

} // namespace
