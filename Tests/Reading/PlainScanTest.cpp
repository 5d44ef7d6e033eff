#include "Reading/Fast/PlainScan.h"
#include "Writing/ScalarStyle.h"

#include <gtest/gtest.h>

#include <cctype>
#include <cstring>
#include <string>

namespace ovrin_yaml {
namespace {

/// The text, with what may be looked at behind it.
std::string Scannable(const std::string& text) {
    return text + std::string(kScanAhead, 'x');
}

bool IsWordCharacter(char c) {
    return std::isalnum(static_cast<unsigned char>(c)) || (c && std::strchr("-./_", c));
}

TEST(PlainScanTest, AWordEndsAtTheFirstOtherByteWhereverThatStands) {
    for (std::size_t length = 0; length < 40; ++length)
        for (int c = 0; c < 256; ++c) {
            const std::string word(length, 'w');
            const std::string text = Scannable(word + static_cast<char>(c) + "w::");
            const std::size_t expected = IsWordCharacter(static_cast<char>(c)) ? length + 2 : length;
            EXPECT_EQ(SkipWord(text.data()) - text.data(), expected) << c << " behind " << length;
        }
}

TEST(PlainScanTest, BlanksEndAtTheFirstOtherByteWhereverThatStands) {
    for (std::size_t length = 0; length < 20; ++length)
        for (const char c : {'m', '\0', '!', '\xA0', '\n'}) {
            const std::string text = Scannable(std::string(length, ' ') + c);
            EXPECT_EQ(SkipBlanks(text.data()) - text.data(), length) << int{c};
        }
}

TEST(PlainScanTest, CharactersThatCountAsPlainAreWrittenPlain) {
    for (int i = 0; i < 256; ++i) {
        const char c = static_cast<char>(i);
        const ScalarForms inside = ClassifyScalar(std::string("a") + c + "a");
        const ScalarForms first = ClassifyScalar(std::string(1, c) + "a");
        EXPECT_EQ(IsPlain(c), inside.plainInBlock && c != ' ' && c != ':' && c != '#') << i;
        EXPECT_EQ(IsPlainInFlow(c), inside.plainInFlow && c != ' ' && c != '#') << i;
        EXPECT_LE(IsPlainStart(c), first.plainInBlock) << i;
    }
}

} // namespace
} // namespace ovrin_yaml
