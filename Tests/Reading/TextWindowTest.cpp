#include "Reading/TextWindow.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace {

using namespace ovrin_yaml;

/// Gives at most `step` bytes at a time.
ByteSource InSteps(const std::string& text, std::size_t step) {
    return [text, step, at = std::size_t{0}](char* bytes, std::size_t size) mutable {
        const std::size_t count = text.copy(bytes, std::min(step, size), at);
        at += count;
        return count;
    };
}

TEST(TextWindow, AnyStepsGiveTheSameDocuments) {
    const std::string first = "--- !o!1 &1\na: '!'\n", second = "--- !o!1 &2\nb: '--- !o!'\n";
    for (std::size_t step = 1; step < 40; ++step) {
        TextWindow window(InSteps(first + second, step));
        EXPECT_EQ(window.Document(), first);
        window.Skip(first.size());
        EXPECT_EQ(window.Document(), second);
        EXPECT_FALSE(window.Reaches(second.size() + 1));
    }
}

} // namespace
