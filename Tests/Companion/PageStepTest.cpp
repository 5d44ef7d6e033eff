#include "Settle/Web/PageStep.h"

#include "Words/Failure.h"

#include <gtest/gtest.h>

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

} // namespace
