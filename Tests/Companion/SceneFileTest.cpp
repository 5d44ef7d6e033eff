#include "Scenes/SceneFile.h"

#include "Scenes/InOrder.h"
#include "Scenes/SceneRules.h"
#include "Words/Failure.h"

#include <algorithm>
#include <atomic>
#include <gtest/gtest.h>

namespace {

using namespace ovrin;

TEST(SceneFile, IsKnownByItsBytes) {
    const std::string scene = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n--- !o!1 &1\nA:\n";
    const struct {
        std::string bytes;
        SceneKind kind;
    } cases[] = {
        {"", SceneKind::Empty},
        {scene, SceneKind::Scene},
        {"\xef\xbb\xbf" + scene, SceneKind::Scene},
        {scene + "<<<<<<< HEAD\n  m: 1\n=======\n  m: 2\n>>>>>>> other\n", SceneKind::Markers},
        {scene + "  m: 2\r\n>>>>>>> other\r\n", SceneKind::Markers},
        {scene + "=======", SceneKind::Markers},
        {"<<<<<<< HEAD\n" + scene + "=======\n" + scene + ">>>>>>> other\n", SceneKind::Markers},
        {scene + "  m: <<<<<<< a\n  =======\n======== a\n=======a\n<<<<<<<\n>>>>>>>a\n", SceneKind::Scene},
        {"Heading\n=======\n", SceneKind::NoScene},
        {"version https://git-lfs.github.com/spec/v1\noid sha256:0\n", SceneKind::LfsPointer},
        {scene + std::string(1, '\0'), SceneKind::Binary},
    };
    for (const auto& [bytes, kind] : cases) EXPECT_EQ(ClassifyScene(bytes), kind) << bytes;
}

TEST(SceneFile, FirstMarkerIsFound) {
    EXPECT_EQ(FindMarker("a\n=======\n>>>>>>> b\n"), 2);
    EXPECT_EQ(FindMarker("||||||| a\n"), 0);
    EXPECT_EQ(FindMarker("a\nb\n"), std::string_view::npos);
}

TEST(SceneRules, FailuresNameTheFile) {
    EXPECT_THROW(ReadSceneRules({.rules = "/nowhere/rules"}), Failure);
    EXPECT_THROW(ReadSceneRules({.typeInfo = "/nowhere/types"}), Failure);
}

TEST(InOrder, ResultsComeInOrderAndFewWait) {
    std::vector<std::size_t> taken;
    std::atomic<std::size_t> begun = 0, mostWaiting = 0;
    const auto make = [&](std::size_t index) {
        ++begun;
        return 2 * index;
    };
    ForEachInOrder(1000, make, [&](std::size_t index, std::size_t result) {
        mostWaiting = std::max<std::size_t>(mostWaiting, begun - taken.size());
        EXPECT_EQ(result, 2 * index);
        taken.push_back(index);
    });
    EXPECT_EQ(taken.size(), 1000);
    EXPECT_TRUE(std::ranges::is_sorted(taken));
    EXPECT_LE(mostWaiting, WaitingResults());
    ForEachInOrder(0, make, [](std::size_t, std::size_t) { FAIL(); });
}

TEST(InOrder, FirstFailureEndsIt) {
    std::size_t taken = 0;
    const auto make = [](std::size_t index) {
        if (index >= 40) throw Failure(std::to_string(index));
        return index;
    };
    try {
        ForEachInOrder(1000, make, [&](std::size_t, std::size_t) { ++taken; });
        FAIL();
    } catch (const Failure& failure) {
        EXPECT_STREQ(failure.what(), "40");
    }
    EXPECT_EQ(taken, 40);
}

} // namespace
