#include "Names/HierarchyOrder.h"

#include "Names/ObjectNames.h"
#include "Support/ObjectText.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <map>
#include <random>

namespace {

using namespace ovrin;
using object_text::Id;
using object_text::Scene;
using IDs = std::vector<const ovrin_yaml::YAMLScalar*>;

std::string Reference(int id) {
    return "{fileID: " + std::to_string(id) + "}";
}

/// A file of GameObjects 10, 20, 30... whose Transforms are 11, 21, 31... A father of 0 is the top; fathers
/// need not be sensible, and one in three doesn't list its children.
std::string RandomScene(std::mt19937& random, int count) {
    std::vector<int> fathers(static_cast<std::size_t>(count) + 1);
    for (int i = 1; i <= count; ++i)
        fathers[static_cast<std::size_t>(i)] = static_cast<int>(random() % static_cast<unsigned>(count + 1));
    std::vector<std::string> lines;
    for (int i = 1; i <= count; ++i) {
        std::string children;
        for (int child = count; child >= 1 && i % 3; --child)
            if (fathers[static_cast<std::size_t>(child)] == i)
                children += (children.empty() ? "" : ", ") + Reference(child * 10 + 1);
        const int father = fathers[static_cast<std::size_t>(i)];
        lines.push_back("1 &" + std::to_string(i * 10) + " GameObject: {m_Component: [{component: " +
                        Reference(i * 10 + 1) + "}, {component: " + Reference(i * 10 + 2) + "}], m_Name: N" +
                        std::to_string(i) + "}\n");
        lines.push_back("4 &" + std::to_string(i * 10 + 1) +
                        " Transform: {m_GameObject: " + Reference(i * 10) + ", m_Children: [" + children +
                        "], m_Father: " + Reference(father ? father * 10 + 1 : 0) + "}\n");
        lines.push_back("108 &" + std::to_string(i * 10 + 2) + " Light: {m_GameObject: " + Reference(i * 10) +
                        "}\n");
    }
    std::shuffle(lines.begin(), lines.end(), random);
    std::string text;
    for (const std::string& line : lines) text += line;
    return text;
}

IDs AllOf(Scene& scene) {
    IDs ids;
    for (const auto& entry : scene.Root().RawEntries()) ids.push_back(entry.key);
    return ids;
}

/// The ids by their ranks.
IDs InOrder(const ObjectNames& names, IDs ids) {
    const ObjectNames* const trees[] = {&names};
    const std::vector<std::uint32_t> ranks = HierarchyRanks(trees, ids);
    std::map<std::uint32_t, const ovrin_yaml::YAMLScalar*> sorted;
    for (std::size_t i = 0; i < ids.size(); ++i) sorted[ranks[i]] = ids[i];
    EXPECT_EQ(sorted.size(), ids.size()) << "ranks of different ids differ";
    ids.clear();
    for (const auto& [rank, id] : sorted) ids.push_back(id);
    return ids;
}

TEST(HierarchyOrder, EverythingStandsBehindWhatIsAboveItAndAheadOfStrangers) {
    std::mt19937 random(5);
    for (int round = 0; round < 60; ++round) {
        Scene scene(RandomScene(random, 1 + round % 9));
        const ObjectNames names(scene.Root());
        std::vector<const ovrin_yaml::YAMLScalar*> way; // from the top to the object at hand
        for (const auto* id : InOrder(names, AllOf(scene))) {
            const auto* above = names.Above(id);
            while (!way.empty() && way.back() != above) way.pop_back();
            EXPECT_EQ(way.empty(), above == nullptr) << id->Value() << " isn't behind its parent";
            way.push_back(id);
        }
    }
}

TEST(HierarchyOrder, OfSomeObjectsIsThatOfAll) {
    std::mt19937 random(6);
    for (int round = 0; round < 60; ++round) {
        Scene scene(RandomScene(random, 1 + round % 9));
        const ObjectNames names(scene.Root());
        const IDs all = InOrder(names, AllOf(scene));
        IDs some = all, expected;
        std::shuffle(some.begin(), some.end(), random);
        some.resize(some.size() / 2);
        std::ranges::copy_if(all, std::back_inserter(expected),
                             [&](const auto* id) { return std::ranges::count(some, id); });
        EXPECT_EQ(InOrder(names, some), expected);
    }
}

TEST(HierarchyOrder, NamesAndWaysUpAlwaysEnd) {
    std::mt19937 random(7);
    for (int round = 0; round < 60; ++round) {
        Scene scene(RandomScene(random, 6));
        const ObjectNames names(scene.Root());
        for (const auto* id : AllOf(scene)) {
            EXPECT_FALSE(names.Name(id).empty());
            std::size_t steps = 0;
            for (const auto* at = id; at; at = names.Above(at)) ASSERT_LE(++steps, 8u);
        }
    }
}

TEST(HierarchyOrder, FirstTreeThatHasAnObjectSaysWhereItStands) {
    Scene first("1 &20 GameObject: {m_Name: B}\n1 &10 GameObject: {m_Name: A}\n"),
        second("1 &10 GameObject: {m_Name: A}\n1 &5 GameObject: {m_Name: C}\n");
    const ObjectNames one(first.Root()), two(second.Root());
    const ObjectNames* const trees[] = {&one, &two};
    const IDs ids = {Id("99"), Id("5"), Id("10"), Id("20"), Id("10"), Id("98")};
    const std::vector<std::uint32_t> ranks = HierarchyRanks(trees, ids);
    EXPECT_LT(ranks[3], ranks[2]); // by the first file
    EXPECT_LT(ranks[2], ranks[1]);
    EXPECT_EQ(ranks[2], ranks[4]);
    EXPECT_LT(ranks[1], ranks[0]); // nowhere, and in the order of the question
    EXPECT_LT(ranks[0], ranks[5]);
    EXPECT_TRUE(HierarchyRanks({}, {}).empty());
}

} // namespace
