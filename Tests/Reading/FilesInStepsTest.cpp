#include "Reading/ObjectFile.h"
#include "Support/Documents.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace {

using namespace documents;

/// Gives at most `step` bytes at a time.
ByteSource InSteps(const std::string& text, std::size_t step) {
    return [text, step, at = std::size_t{0}](char* bytes, std::size_t size) mutable {
        const std::size_t count = text.copy(bytes, std::min(step, size), at);
        at += count;
        return count;
    };
}

/// The signature of a file is looked for in its bytes, and its text ends at the first NUL.
TEST(FilesInSteps, BytesBehindANulTellOfTheSignatureStill) {
    using namespace std::string_literals;
    const std::string text = ObjectText("--- !o!1 &1\na: 1\n");
    for (const std::string& file : {"\0"s + text, "\0\0\0\0"s + text, "\0\0\0\0\0"s + text,
                                    text.substr(0, 3) + "\0"s + text, text + "\0x"s, "\0"s, ""s}) {
        OvrinObjects objects, whole, stepwise;
        ObjectFile base(objects, {}), expected(whole, {});
        base.Take(text);
        base.Cut(nullptr);
        const std::string failure = ErrorOf([&] { expected.Take(file); });
        for (const std::size_t step : {1, 6, 1000}) {
            ObjectFile along(stepwise, {});
            EXPECT_EQ(ErrorOf([&] { along.TakeAlong(InSteps(file, step), base); }), failure) << file;
        }
    }
}

TEST(FilesInSteps, AnyStepsGiveTheSameDocuments) {
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
