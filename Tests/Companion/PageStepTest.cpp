#include "Settle/Web/PageStep.h"

#include "Words/Failure.h"

#include <gtest/gtest.h>
#include <sstream>

namespace {

using namespace ovrin;

TEST(PageStepTest, StepsAreReadInFull) {
    const PageStep step = ReadStep(R"({"item": 3, "side": "theirs", "revision": 18446744073709551615})");
    EXPECT_EQ(step.revision, ~std::uint64_t{0});
    EXPECT_EQ(std::get<TakeItem>(step.step).item, 3);
    EXPECT_EQ(std::get<TakeItem>(step.step).side, Side::Theirs);
    EXPECT_EQ(std::get<TakeBelow>(ReadStep(R"({"revision":1,"side":"base","under":7})").step).under, 7);
    EXPECT_EQ(std::get<TakeRest>(ReadStep(R"({"all":true,"side":"ours","revision":1})").step).side,
              Side::Ours);
    EXPECT_TRUE(std::holds_alternative<TakeProposals>(ReadStep(R"({"proposed":true,"revision":1})").step));
    EXPECT_EQ(std::get<TakeRemedy>(ReadStep(R"({"problem":0,"remedy":2,"revision":1})").step).remedy, 2);
    EXPECT_TRUE(ReadFinish(R"({"overwrite":true,"revision":1})").overwrite);
    EXPECT_NO_THROW(ReadNothing("{}"));
}

TEST(PageStepTest, WhatIsNotUnderstoodInFullIsNoStep) {
    for (const char* body : {"",
                             "{",
                             "null",
                             "[]",
                             "3",
                             "{}",
                             R"({"item":3,"side":"ours"})",
                             R"({"item":3,"revision":1})",
                             R"({"item":"3","side":"ours","revision":1})",
                             R"({"item":-1,"side":"ours","revision":1})",
                             R"({"item":1.0,"side":"ours","revision":1})",
                             R"({"item":18446744073709551616,"side":"ours","revision":1})",
                             R"({"item":3,"side":"mine","revision":1})",
                             R"({"item":3,"side":0,"revision":1})",
                             R"({"item":3,"side":"ours","revision":"1"})",
                             R"({"item":3,"side":"ours","revision":1,"path":"/etc"})",
                             R"({"item":3,"under":3,"side":"ours","revision":1})",
                             R"({"all":false,"side":"ours","revision":1})",
                             R"({"all":1,"side":"ours","revision":1})",
                             R"({"proposed":true,"side":"ours","revision":1})",
                             R"({"problem":0,"revision":1})",
                             R"({"item":3,"side":"ours","revision":1} x)",
                             "\xff{}"})
        EXPECT_THROW(ReadStep(body), Failure) << body;
    for (const char* body : {"{}", R"({"overwrite":"yes","revision":1})", R"({"overwrite":true})"})
        EXPECT_THROW(ReadFinish(body), Failure) << body;
    EXPECT_THROW(ReadRevision(R"({"revision":1,"more":1})"), Failure);
    EXPECT_THROW(ReadNothing(R"({"x":1})"), Failure);
}

TEST(PageStepTest, WhatIsToldTwiceIsNoStep) {
    for (const char* body : {R"({"item":3,"item":4,"side":"ours","revision":1})",
                             R"({"item":3,"side":"ours","side":"ours","revision":1})",
                             R"({"item":3,"side":"ours","revision":1,"revision":2})",
                             R"({"item":3,"\u0069tem":4,"side":"ours","revision":1})"})
        EXPECT_THROW(ReadStep(body), Failure) << body;
    EXPECT_THROW(ReadFinish(R"({"overwrite":false,"overwrite":true,"revision":1})"), Failure);
}

TEST(PageStepTest, ValuesThatNobodySendsAreToldAsFailures) {
    std::istringstream words(
        R"(null true [] {} -0 -1 1.0 1e0 1e999 0x1 01 NaN "\ud800" "\u0000" "ours\u0000")"
        " \"\xff\"");
    std::vector<std::string> values = {std::string(60000, '[') + std::string(60000, ']'),
                                       std::string(5000, '9')};
    for (std::string word; words >> word;) values.push_back(word);
    for (const std::string& value : values) {
        EXPECT_THROW(ReadStep(R"({"item":)" + value + R"(,"side":"ours","revision":1})"), Failure) << value;
        EXPECT_THROW(ReadStep(R"({"item":1,"side":)" + value + R"(,"revision":1})"), Failure) << value;
        EXPECT_THROW(ReadRevision(R"({"revision":)" + value + "}"), Failure) << value;
        EXPECT_THROW(ReadNothing(R"({"x":)" + value + "}"), Failure) << value;
    }
}

/// A step as it was changed on the way is none, or is one; it is never something else that is thrown.
TEST(PageStepTest, StepThatIsCutOrChangedIsNeverHalfAStep) {
    const std::string body = R"({"item":3,"side":"theirs","revision":7})";
    for (std::size_t at = 0; at < body.size(); ++at) {
        EXPECT_THROW(ReadStep(body.substr(0, at)), Failure) << at;
        for (int byte = 0; byte < 256; ++byte) {
            std::string changed = body;
            changed[at] = static_cast<char>(byte);
            try {
                const TakeItem take = std::get<TakeItem>(ReadStep(changed).step);
                EXPECT_EQ(take.side, Side::Theirs) << changed;
                EXPECT_LT(take.item, 10) << changed;
            } catch (const Failure&) {
            }
        }
    }
}

} // namespace
