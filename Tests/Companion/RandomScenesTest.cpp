#include "Changes/ChangeJson.h"
#include "Changes/ChangeMarkdown.h"
#include "Changes/ChangeText.h"
#include "Changes/FileChange.h"
#include "Checks/SceneCheck.h"
#include "Conflicts/ConflictReport.h"
#include "Names/PrintableText.h"
#include "Names/ValueLines.h"
#include "Names/ValueText.h"
#include "Words/Failure.h"

#include "SceneGenerator.h"
#include "Support/RandomDocuments.h"

#include "Reading/ObjectFileReader.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <sstream>

// What holds of any scene, be it damaged or made to do harm.

namespace {

using namespace ovrin;
using random_documents::RandomDocuments;

constexpr const char* kHeader = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";

std::string RandomScene(RandomDocuments& random, int objects) {
    std::string text = kHeader;
    for (int id = 1; id <= objects; ++id)
        text += "--- !o!" + std::to_string(id) + " &" + std::to_string(id * 10) + "\n" + random.Body();
    return text;
}

FileVersion Version(const std::string& text) {
    return [text](const IsWanted& isWanted) { return isWanted(text) ? std::optional(text) : std::nullopt; };
}

FileChange Compared(const std::string& before, const std::string& after) {
    return CompareFile({{FileStatus::Changed, "a.ovrin", "a.ovrin"}, Version(before), Version(after)}, {},
                       {.width = 40, .withValues = true});
}

bool IsForTerminals(const std::string& text) {
    return PrintableLines(text) == text;
}

struct RandomScenes : testing::TestWithParam<unsigned> {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }

    RandomDocuments random{GetParam()};
};

TEST_P(RandomScenes, CheckTellsOfEveryOneWithoutAnEnd) {
    for (int round = 0; round < 40; ++round) {
        const std::string scene = random.Damaged(RandomScene(random, 3));
        const auto lines = static_cast<std::size_t>(std::ranges::count(scene, '\n')) + 1;
        for (const Finding& finding : CheckScene(scene, {})) {
            EXPECT_LE(finding.line, lines);
            EXPECT_TRUE(IsForTerminals(finding.name + finding.message)) << finding.message;
        }
    }
}

TEST_P(RandomScenes, NothingDiffersFromItself) {
    for (int round = 0; round < 20; ++round) {
        const std::string scene = RandomScene(random, 3);
        const FileChange change = Compared(scene, scene);
        EXPECT_TRUE(change.scene ? change.scene->objects.empty() : !change.reason.empty()) << scene;
    }
}

TEST_P(RandomScenes, WhatChangedIsToldInFormsThatCanBeRead) {
    for (int round = 0; round < 30; ++round) {
        const std::string scene = RandomScene(random, 3);
        const FileChange change = Compared(scene, random.Damaged(scene));
        EXPECT_EQ(change.scene.has_value(), change.reason.empty());
        EXPECT_TRUE(IsForTerminals(ChangeText(change, false))) << ChangeText(change, false);
        EXPECT_TRUE(IsForTerminals(ChangeMarkdown(std::span(&change, 1))));
        EXPECT_TRUE(nlohmann::json::accept(ChangeJson(std::span(&change, 1))));
    }
}

TEST_P(RandomScenes, ValuesAreToldInOneLineOfTheirWidth) {
    for (int round = 0; round < 30; ++round) {
        ovrin_yaml::OvrinObjects objects;
        try {
            ovrin_yaml::ParseYAMLString(random.Damaged(RandomScene(random, 1)), objects);
        } catch (const ovrin_yaml::YAMLError&) {
            continue; // can't be read
        }
        const ObjectNames names(objects.GetMapping());
        for (const auto& entry : objects.GetMapping().RawEntries()) {
            const std::string line = ValueLine(*entry.value, names);
            EXPECT_EQ(Printable(line), line);
            EXPECT_LE(CharacterCount(ValueLine(*entry.value, names, 12)), 12u) << line;
            for (const std::string& each : ValueLines(*entry.value, names)) EXPECT_EQ(Printable(each), each);
        }
    }
}

/// The three may be anything: then there is a result that can be read again, or a word that tells why not.
TEST_P(RandomScenes, MergeHasAResultOrAReason) {
    for (int round = 0; round < 30; ++round) {
        const std::string base = RandomScene(random, 2);
        try {
            SceneMerge merge({base, random.Damaged(base), random.Damaged(base)}, {}, {},
                             ovrin_yaml::Threads::None);
            merge.Merge();
            EXPECT_TRUE(IsForTerminals(TellConflicts(merge, {"", "\x1b", "\n"})));
            EXPECT_TRUE(nlohmann::json::accept(
                ConflictsToJson(merge).dump(-1, ' ', true, nlohmann::json::error_handler_t::replace)));
            const std::string result = merge.Result();
            SceneMerge again({result, result, result}, {}, {}, ovrin_yaml::Threads::None);
            again.Merge();
            EXPECT_TRUE(again.Result() == result);
        } catch (const Failure& failure) {
            EXPECT_TRUE(IsForTerminals(failure.what())) << failure.what();
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Seeds, RandomScenes, testing::Values(1, 2, 3, 4));

/// Edits of many kinds, seen from both ends.
TEST(SceneChanges, BackwardsAreThoseForwardsExchanged) {
    for (const std::uint64_t seed : {1, 2, 3}) {
        std::ostringstream base, left, right;
        ovrin_bench::GenerateScene({.seed = seed, .objects = 150, .edited = 300'000},
                                   {base, left, right, nullptr});
        const FileChange forwards = Compared(base.str(), left.str()),
                         backwards = Compared(left.str(), base.str());
        ASSERT_TRUE(forwards.scene && backwards.scene);
        EXPECT_EQ(forwards.scene->added, backwards.scene->removed);
        EXPECT_EQ(forwards.scene->removed, backwards.scene->added);
        EXPECT_EQ(forwards.scene->changed, backwards.scene->changed);
        EXPECT_EQ(forwards.scene->moved, backwards.scene->moved);
        EXPECT_GT(forwards.scene->changed, 0u);
    }
}

TEST(SceneChanges, CountsAreThoseOfWhatWasEdited) {
    using Mode = ovrin_bench::SceneOptions::Mode;
    for (const Mode mode : {Mode::Remove, Mode::Add}) {
        std::ostringstream base, left, right;
        const ovrin_bench::SceneCounts made = ovrin_bench::GenerateScene(
            {.mode = mode, .seed = 5, .objects = 300, .edited = 200'000}, {base, left, right, nullptr});
        EXPECT_GT(made.added[1] + made.removed[1], 0u);
        const FileChange change = Compared(base.str(), right.str());
        EXPECT_EQ(change.scene->added, made.added[1]);
        EXPECT_EQ(change.scene->removed, made.removed[1]);
    }
}

} // namespace
