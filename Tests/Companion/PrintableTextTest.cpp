#include "Names/PrintableText.h"

#include "Words/Markdown.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <random>

namespace {

using namespace ovrin;

/// Texts of characters, of pieces of them, and of what terminals and readers take for more than a sign.
std::vector<std::string> RandomTexts() {
    const std::vector<std::string> pieces = {"a",
                                             "\\",
                                             "ä",
                                             "→",
                                             "😀",
                                             "\n",
                                             "\t",
                                             "\r",
                                             "\x1b[2J",
                                             "\x7f",
                                             "\xc2\x85",
                                             "\xe2\x80\xae",
                                             "\xef\xbb\xbf",
                                             "\xff",
                                             "\xe2\x86",
                                             "\xf0\x9f",
                                             "\xc0\x80",
                                             "\xed\xa0\x80",
                                             "`",
                                             " ",
                                             std::string(1, '\0'),
                                             "\xf4\x90\x80\x80"};
    std::mt19937 random(11);
    std::vector<std::string> texts(600);
    for (std::string& text : texts)
        for (std::size_t length = random() % 9; length > 0; --length)
            text += pieces[random() % pieces.size()];
    return texts;
}

bool IsUtf8(const std::string& text) {
    try {
        nlohmann::json(text).dump();
        return true;
    } catch (const nlohmann::json::exception&) {
        return false;
    }
}

TEST(Printable, HarmfulCharactersStandAsEscapes) {
    const std::pair<std::string, const char*> cases[] = {
        {"", ""},
        {"Träger → 😀 \\n", "Träger → 😀 \\n"},
        {"a\nb\tc\r", "a\\nb\\tc\\r"},
        {std::string(1, '\0') + "\x1b\x7f", "\\x00\\x1b\\x7f"},
        {"\xc2\x9b", "\\u009b"},
        {"\xe2\x80\xae\xe2\x81\xa6\xd8\x9c", "\\u202e\\u2066\\u061c"},
        {"\xe2\x80\xa8\xef\xbb\xbf", "\\u2028\\ufeff"},
        {"\xff\xc3", "\\xff\\xc3"},
        {"\xc0\xaf\xed\xa0\x80", "\\xc0\\xaf\\xed\\xa0\\x80"},
        {"\xf4\x8f\xbf\xbf\xf4\x90\x80\x80", "\xf4\x8f\xbf\xbf\\xf4\\x90\\x80\\x80"},
    };
    for (const auto& [text, printed] : cases) EXPECT_EQ(Printable(text), printed);
}

TEST(Printable, WhatIsPrintableStaysAndIsOneLineOfUtf8) {
    for (const std::string& text : RandomTexts()) {
        const std::string printed = Printable(text);
        EXPECT_EQ(Printable(printed), printed);
        EXPECT_TRUE(IsUtf8(printed)) << testing::PrintToString(text);
        EXPECT_EQ(printed.find_first_of(std::string("\n\r\t\x1b\x7f\0", 6)), std::string::npos);
        EXPECT_GE(printed.size(), text.size());
    }
}

TEST(Printable, LinesKeepTheirEndsAlone) {
    EXPECT_EQ(PrintableLines("a\tb\n\n\x1b\r\n"), "a\tb\n\n\\x1b\\r\n");
    for (const std::string& text : RandomTexts()) {
        const std::string printed = PrintableLines(text);
        EXPECT_EQ(PrintableLines(printed), printed);
        for (const char end : {'\n', '\t'})
            EXPECT_EQ(std::ranges::count(printed, end), std::ranges::count(text, end));
        EXPECT_EQ(printed.find_first_of("\r\x1b\x7f\xff"), std::string::npos);
    }
}

TEST(Shortened, TextsHaveAtMostTheirWidth) {
    for (const std::string& text : RandomTexts()) {
        const std::string printed = Printable(text);
        for (const std::size_t width : {1, 2, 3, 7}) {
            const std::string atEnd = ShortenedAtEnd(printed, width),
                              inMiddle = ShortenedInMiddle(printed, width);
            const std::size_t expected = std::min(CharacterCount(printed), width);
            EXPECT_EQ(CharacterCount(atEnd), expected) << printed;
            EXPECT_EQ(CharacterCount(inMiddle), expected) << printed;
            EXPECT_TRUE(IsUtf8(atEnd) && IsUtf8(inMiddle)) << printed;
        }
        EXPECT_EQ(ShortenedAtEnd(printed, 0) + ShortenedInMiddle(printed, 0), printed + printed);
    }
}

TEST(Shortened, BeginningAndEndStay) {
    EXPECT_EQ(ShortenedAtEnd("abcdef", 4), "abc…");
    EXPECT_EQ(ShortenedInMiddle("abcdef", 4), "ab…f");
    EXPECT_EQ(ShortenedInMiddle("abcdef", 5), "ab…ef");
    EXPECT_EQ(ShortenedInMiddle("äöüß", 3), "ä…ß");
    EXPECT_EQ(FirstCharacters("äö", 1), "ä");
    EXPECT_EQ(FirstCharacters("äö", 9), "äö");
}

/// As a reader of Markdown takes a span: between runs of backticks of one length, and a blank off both ends.
std::string ReadSpan(const std::string& span) {
    const std::size_t fence = span.find_first_not_of('`');
    EXPECT_NE(fence, std::string::npos) << span;
    EXPECT_EQ(span.find_last_not_of('`'), span.size() - fence - 1) << span;
    std::string text = span.substr(fence, span.size() - 2 * fence);
    EXPECT_EQ(text.find(std::string(fence, '`')), std::string::npos) << span;
    const bool isPadded =
        text.starts_with(' ') && text.ends_with(' ') && text.find_first_not_of(' ') != std::string::npos;
    return isPadded ? text.substr(1, text.size() - 2) : text;
}

TEST(CodeSpan, IsReadAsTheTextThatItHolds) {
    for (const char* text : {"a", "`", "``", "a`b", " a ", " a", "`a``", "a```", " ` ", "<b>*a* @b", "\\`"})
        EXPECT_EQ(ReadSpan(CodeSpan(text)), text);
    for (const std::string& text : RandomTexts())
        for (const std::string& line : {"a" + Printable(text), Printable(text) + "`"})
            EXPECT_EQ(ReadSpan(CodeSpan(line)), line);
    EXPECT_EQ(CodeSpan(""), "");
}

} // namespace
