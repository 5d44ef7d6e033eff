#include "Conflicts/DecisionPath.h"

#include "Conflicts/OpenMerge.h"
#include "Values/YAMLScalar.h"
#include "Words/Failure.h"

#include <gtest/gtest.h>
#include <random>

namespace {

using namespace ovrin;
using ovrin_yaml::Path;
using ovrin_yaml::YAMLScalar;

Path PathOf(std::initializer_list<const char*> elements) {
    Path path;
    for (const char* element : elements) path.push_back(YAMLScalar::Lookup(element));
    return path;
}

struct DecisionPathTest : testing::Test {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }
};

TEST_F(DecisionPathTest, ElementsAreJoinedByDots) {
    const std::pair<Path, const char*> cases[] = {
        {PathOf({"10", "Light", "x"}), "10.Light.x"},     {PathOf({"10"}), "10"},
        {PathOf({"10", "a.b\\c", ""}), "10.a\\.b\\\\c."}, {PathOf({"", "", ""}), ".."},
        {PathOf({"*", "a b\n", "ä"}), "*.a b\n.ä"},
    };
    for (const auto& [path, text] : cases) {
        EXPECT_EQ(DecisionPath(path), text);
        EXPECT_EQ(PathOfDecision(text), path) << text;
    }
}

TEST_F(DecisionPathTest, EveryPathComesBack) {
    std::mt19937 random(3);
    for (int round = 0; round < 2000; ++round) {
        Path path;
        for (std::size_t elements = 1 + random() % 4; elements > 0; --elements) {
            std::string element;
            while (random() % 4) element += ".\\a*\xff\n"[random() % 6];
            path.push_back(YAMLScalar::Lookup(element));
        }
        EXPECT_EQ(PathOfDecision(DecisionPath(path)), path) << DecisionPath(path);
    }
}

TEST_F(DecisionPathTest, TextsOfPeopleStandForSomePath) {
    EXPECT_EQ(PathOfDecision(""), PathOf({""}));
    EXPECT_EQ(PathOfDecision("a\\b"), PathOf({"ab"}));
    EXPECT_EQ(PathOfDecision("a\\"), PathOf({"a\\"}));
}

TEST(Side, NamesLeadBackToTheirSides) {
    for (const Side side : {Side::Base, Side::Ours, Side::Theirs}) EXPECT_EQ(SideNamed(SideName(side)), side);
    for (const char* name : {"", "Ours", "left", "ours ", "theirs\n"})
        EXPECT_THROW(SideNamed(name), Failure) << name;
}

} // namespace
