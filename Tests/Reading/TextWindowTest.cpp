#include "Reading/TextWindow.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace {

using namespace ovrin_yaml;

/// Gives at most `step` bytes at a time.
ByteSource InSteps(const std::string& text, std::size_t step) {
    return [text, step, at = std::size_t{0}](char* bytes, std::size_t size) mutable {
        const std::size_t count = std::min({step, size, text.size() - at});
        std::copy_n(text.data() + at, count, bytes);
        at += count;
        return count;
    };
}

constexpr std::size_t kUsualSize = std::size_t{1} << 20;

/// The documents that a window finds, with "|" in front of each.
std::string Documents(TextWindow window) {
    std::string found;
    for (; window.Reaches(1); window.Skip(window.Document().size()))
        found += "|" + std::string(window.Document());
    return found;
}

TEST(TextWindow, DocumentsAreTheSameHoweverTheBytesCome) {
    const std::string first = "--- !o!1 &1\na: b!\n- !o!1\n", last = "--- !o!1 &2\nc", all = first + last;
    for (const std::size_t size : {std::size_t{1}, std::size_t{20}, kUsualSize})
        for (const std::size_t step : {1, 2, 7, 100})
            EXPECT_EQ(Documents(TextWindow(InSteps(all, step), size)), "|" + first + "|" + last);
    EXPECT_EQ(Documents(TextWindow(std::string_view(all))), "|" + first + "|" + last);
    EXPECT_EQ(Documents(TextWindow(InSteps("", 1), kUsualSize)), "");
}

TEST(TextWindow, DocumentsMayBeLongerThanAnyRoomForThem) {
    std::string all;
    for (const std::size_t length : {5, 3000000, 1048576, 1, 9000000})
        all += "|--- !o!1 &1\n" + std::string(length, 'x') + "\n";
    std::string text = all;
    std::erase(text, '|');
    EXPECT_TRUE(Documents(TextWindow(InSteps(text, text.size()), kUsualSize)) == all);
    EXPECT_TRUE(Documents(TextWindow(InSteps(text, 999), kUsualSize)) == all);
}

/// Whoever looks far ahead at each step makes the window move its bytes only now and then.
TEST(TextWindow, SmallStepsWithALongViewReadSeldom) {
    constexpr std::size_t kView = 2000000, kStep = 1000;
    const std::string text(5 * kView, 'x');
    std::size_t reads = 0;
    const ByteSource counted = [&, source = InSteps(text, text.size())](char* bytes,
                                                                        std::size_t size) mutable {
        ++reads;
        return source(bytes, size);
    };
    TextWindow window(counted, kUsualSize);
    while (window.Reaches(kView)) window.Skip(kStep);
    EXPECT_LT(reads, 10u);
}

TEST(TextWindow, TextEndsAtTheFirstNul) {
    using namespace std::string_literals;
    for (const std::size_t step : {1, 3, 100}) {
        TextWindow window(InSteps("ab\0cd"s, step), kUsualSize);
        EXPECT_TRUE(window.Reaches(2));
        EXPECT_FALSE(window.Reaches(3));
        EXPECT_EQ(window.Rest(), "ab");
        window.Skip(1);
        EXPECT_EQ(window.Rest(), "b");
        window.Skip(1);
        EXPECT_FALSE(window.Reaches(1));
    }
}

} // namespace
