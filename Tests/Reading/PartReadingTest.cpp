#include "ErrorOf.h"

#include "Reading/PartReading.h"
#include "Values/YAMLError.h"
#include "Writing/WrittenForm.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <ranges>
#include <string>

namespace {

using namespace ovrin_yaml;

PartSource Of(const std::string& text) {
    return [text](std::size_t offset, char* bytes, std::size_t size) {
        const std::size_t count = offset < text.size() ? std::min(size, text.size() - offset) : 0;
        std::copy_n(text.data() + (count ? offset : 0), count, bytes);
        return count;
    };
}

/// Last task first: nothing may depend on the order.
void Backwards(std::size_t count, const std::function<void(std::size_t)>& task) {
    while (count > 0) task(--count);
}

TEST(PartReading, DocumentsBeginWhereTheyDoInTheWhole) {
    using namespace std::string_literals;
    const std::string pieces[] = {
        "\n--- !o!", "--- !o!", "\n---", " !o!", "!", "\n", "-", "\n--- !o!1 &2\na: b"s, "\0"s};
    std::mt19937 random(1);
    for (int round = 0; round < 3000; ++round) {
        std::string text = "%YAML";
        for (std::size_t left = random() % 30; left > 0; --left)
            text += pieces[random() % (std::size(pieces) - (round % 4 != 0))];
        const std::string known = text.substr(0, text.find('\0'));
        std::vector<std::size_t> starts;
        for (std::size_t at = 0; (at = known.find(kNextHeader, at)) != std::string::npos;)
            starts.push_back(++at);
        const auto read = ReadInParts(Of(text), text.size(), Backwards, 1 + random() % 25);
        ASSERT_TRUE(read);
        EXPECT_EQ(read->bytes, text);
        EXPECT_EQ(read->length, known.size());
        EXPECT_EQ(read->starts, starts) << testing::PrintToString(text);
    }
}

TEST(PartReading, AFileOfAnotherSizeIsNotReadInParts) {
    const std::string text(100, 'x');
    EXPECT_FALSE(ReadInParts(Of(text), 99, Backwards, 10));
    EXPECT_FALSE(ReadInParts(Of(text), 101, Backwards, 10));
    EXPECT_FALSE(ReadInParts(Of(text), 200, Backwards, 10));
    EXPECT_TRUE(ReadInParts(Of(text), 100, Backwards, 10));
}

TEST(PartReading, WhatFailsInAPartIsThrown) {
    const PartSource broken = [](std::size_t offset, char*, std::size_t size) {
        if (offset >= 50) throw YAMLError("Cannot read file");
        return size;
    };
    EXPECT_EQ(failures::ErrorOf([&] { ReadInParts(broken, 100, Backwards, 10); }), "Cannot read file");
}

} // namespace
