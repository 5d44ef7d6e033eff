#include "Conflicts/OpenMerges.h"

#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>

namespace {

using namespace ovrin;

struct OpenMergesTest : testing::Test {
    OpenMergesTest() {
        char folder[] = "/tmp/ovrin-test-XXXXXX";
        data = mkdtemp(folder);
    }
    ~OpenMergesTest() override { std::filesystem::remove_all(data); }

    OpenMerge Added(const std::string& path) {
        OpenMerge merge;
        merge.path = path;
        merge.occasion = {"merge", "", "main", "topic\xff", "1234"};
        merge.conflicts = 3;
        merge.texts = {"base\n", std::string("ours\0\n", 6), "theirs"};
        merges().Add(merge);
        return merge;
    }
    OpenMerges merges() const { return OpenMerges({SystemKind::Git, "", data}); }

    std::string data;
};

TEST_F(OpenMergesTest, KeepsEveryByteOfAMerge) {
    const OpenMerge added = Added("odd \n\"name\"\xfe.ovrin");
    const std::optional<OpenMerge> found = merges().Find(added.path);
    ASSERT_TRUE(found);
    EXPECT_EQ(found->texts.ours, added.texts.ours);
    EXPECT_EQ(found->texts.theirs, "theirs");
    EXPECT_EQ(found->occasion.ours, "main");
    EXPECT_EQ(found->conflicts, 3);
    EXPECT_FALSE(merges().Find("another.ovrin"));
}

TEST_F(OpenMergesTest, AreListedByPathAndForgotten) {
    Added("b.ovrin");
    Added("a.ovrin");
    EXPECT_EQ(merges().List().at(0).path, "a.ovrin");
    EXPECT_EQ(merges().List().at(1).path, "b.ovrin");
    merges().Remove("a.ovrin");
    merges().Remove("b.ovrin");
    merges().Remove("never there");
    EXPECT_TRUE(merges().List().empty());
    EXPECT_FALSE(std::filesystem::exists(data + "/ovrin"));
}

TEST_F(OpenMergesTest, DecisionsBelongToTheirMergeAlone) {
    const OpenMerge first = Added("a.ovrin");
    merges().SetProgress(first, {{{"1.Thing.x", Side::Theirs}}, 2, {{1, 7}}});
    EXPECT_EQ(merges().ProgressOf(first).decisions.at(0).side, Side::Theirs);
    EXPECT_EQ(merges().ProgressOf(first).open, 2);
    EXPECT_EQ(merges().ProgressOf(first).steps.at(0).number, 7);
    const OpenMerge second = Added("a.ovrin");
    EXPECT_TRUE(merges().ProgressOf(second).decisions.empty());
    EXPECT_EQ(merges().ProgressOf(second).open, 3);
}

TEST_F(OpenMergesTest, WhatIsBrokenIsToldAndNotTakenForNothing) {
    Added("a.ovrin");
    for (const auto& entry : std::filesystem::directory_iterator(data + "/ovrin"))
        std::filesystem::resize_file(entry.path(), 60);
    EXPECT_THROW(merges().List(), Failure);
    EXPECT_THROW(merges().Find("a.ovrin"), Failure);
    Added("a.ovrin"); // the scene is merged again
    EXPECT_EQ(merges().List().at(0).path, "a.ovrin");
}

} // namespace
