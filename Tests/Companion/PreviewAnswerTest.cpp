#include "Preview/AnswerMarkdown.h"
#include "Preview/AnswerText.h"
#include "Preview/Join.h"
#include "Preview/Question.h"
#include "Preview/ScenePreview.h"
#include "Preview/Sharing.h"
#include "Scenes/SceneRules.h"
#include "Words/Failure.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <random>

namespace {

using namespace ovrin;
using nlohmann::json;

const NamedCommit kOurs = {"main", "1111"}, kTheirs = {"topic", "2222"};

/// Answers of all that there is in them, with texts of all kinds.
PreviewAnswer RandomAnswer(std::mt19937& random) {
    const std::vector<std::string> texts = {"", "a", "Träger/\"b\"\\\n", "`<b>@x", "--- 10 {}", "a\tb"};
    const auto text = [&] { return texts[random() % texts.size()]; };
    PreviewAnswer answer;
    answer.ours = {text(), text()};
    answer.theirs = {text(), text()};
    answer.question = text();
    answer.part = {1 + random() % 3, 3};
    answer.count = random() % 6;
    answer.scenes.resize(answer.count);
    for (std::size_t i = 0; i < answer.count; ++i) {
        PreviewedScene& scene = answer.scenes[i];
        scene.number = i + 1;
        scene.path = text();
        scene.meeting = static_cast<Meeting>(random() % 5);
        scene.verdict = static_cast<Verdict>(random() % 3);
        scene.isByObjects = random() % 2;
        scene.gitConflicts = {text(), text()};
        scene.problem = text();
        if (random() % 2) scene.conflicts = {{{"path", text()}}};
        scene.report = text();
    }
    return answer;
}

TEST(PreviewAnswer, ComesBackFromJson) {
    std::mt19937 random(8);
    for (int round = 0; round < 200; ++round) {
        const PreviewAnswer answer = RandomAnswer(random), back = AnswerOfJson(ToJson(answer));
        EXPECT_EQ(ToJson(back), ToJson(answer));
        EXPECT_EQ(ToText(back), ToText(answer));
        EXPECT_EQ(ToMarkdown(back), ToMarkdown(answer));
    }
}

TEST(PreviewAnswer, BytesThatAreNoTextAreReplaced) {
    PreviewAnswer answer;
    answer.scenes.resize(1);
    answer.scenes[0].path = "a\xff.ovrin";
    EXPECT_EQ(AnswerOfJson(ToJson(answer)).scenes.at(0).path, "a\xef\xbf\xbd.ovrin");
}

/// All places of a value, those of its own first.
void CollectPlaces(const json& value, const json::json_pointer& place,
                   std::vector<json::json_pointer>& places) {
    places.push_back(place);
    if (value.is_object())
        for (const auto& [key, inner] : value.items()) CollectPlaces(inner, place / key, places);
    if (value.is_array())
        for (std::size_t i = 0; i < value.size(); ++i) CollectPlaces(value[i], place / i, places);
}

/// Files of parts are somebody's, and may hold anything.
TEST(PreviewAnswer, ChangedFileIsAnAnswerOrAFailure) {
    std::mt19937 random(9);
    PreviewAnswer answer = RandomAnswer(random);
    while (answer.scenes.empty()) answer = RandomAnswer(random);
    const json sound = json::parse(ToJson(answer));
    std::vector<json::json_pointer> places;
    CollectPlaces(sound, json::json_pointer(), places);
    for (const json::json_pointer& place : places)
        for (const json& other :
             {json(), json(-1), json(1e99), json("x"), json::array(), json::object(), json(true)}) {
            json changed = sound;
            changed[place] = other;
            try {
                AnswerOfJson(changed.dump());
            } catch (const Failure&) {
                continue;
            }
        }
}

TEST(PreviewAnswer, NoFieldMayBeMissing) {
    std::mt19937 random(10);
    const json sound = json::parse(ToJson(RandomAnswer(random)));
    for (const auto& [key, value] : sound.items()) {
        json changed = sound;
        changed.erase(key);
        if (key == "sum") // is for readers
            EXPECT_NO_THROW(AnswerOfJson(changed.dump()));
        else
            EXPECT_THROW(AnswerOfJson(changed.dump()), Failure) << key;
    }
}

TEST(PreviewAnswer, SumCountsEachSort) {
    PreviewAnswer answer;
    answer.scenes.resize(4);
    answer.scenes[0].verdict = Verdict::Conflicts;
    answer.scenes[1].verdict = Verdict::Unknown;
    answer.scenes[1].isByObjects = answer.scenes[2].isByObjects = false;
    const ScenesInSum sum = Sum(answer);
    EXPECT_EQ((std::vector{sum.all, sum.conflicting, sum.unknown, sum.byLines}),
              (std::vector<std::size_t>{4, 1, 1, 2}));
    EXPECT_FALSE(IsTold(answer.scenes[3]));
    for (int i = 0; i < 3; ++i) EXPECT_TRUE(IsTold(answer.scenes[static_cast<std::size_t>(i)]));
}

/// A file with these sides: 'f' a file, 'l' a link, '-' nothing.
UnmergedFile File(const std::string& sides, std::vector<std::string> conflicts = {}) {
    UnmergedFile file;
    file.path = "a.ovrin";
    file.conflicts = std::move(conflicts);
    std::optional<TreeEntry>* const entries[] = {&file.base, &file.ours, &file.theirs};
    for (std::size_t i = 0; i < 3; ++i)
        if (sides[i] != '-') *entries[i] = TreeEntry{"1234", sides[i] == 'f', 100};
    return file;
}

TEST(PlaceScene, TellsWhatTheSidesDid) {
    const struct {
        const char* sides;
        std::vector<std::string> conflicts;
        Meeting meeting;
        const char* problem;
    } cases[] = {
        {"fff", {}, Meeting::BothChanged, ""},
        {"-ff", {"add/add"}, Meeting::BothAdded, "both sides added it; git leaves it unmerged (add/add)"},
        {"f-f", {"modify/delete"}, Meeting::OursRemoved, "main removed it, topic changed it"},
        {"ff-", {"modify/delete"}, Meeting::TheirsRemoved, "topic removed it, main changed it"},
        {"ff-", {"rename/delete"}, Meeting::TheirsRemoved, "topic removed it, main renamed it"},
        {"f--", {"rename/rename"}, Meeting::Misplaced, "the sides renamed it differently"},
        {"-f-", {"file/directory"}, Meeting::Misplaced, "a folder of the other side has its name"},
        {"flf",
         {"distinct types", "distinct modes"},
         Meeting::BothChanged,
         "one side made something else of it, such as a link"},
        {"--f", {}, Meeting::Misplaced, "git leaves it unmerged"},
        {"fff", {"of tomorrow"}, Meeting::BothChanged, "git leaves it unmerged (of tomorrow)"},
    };
    for (const auto& [sides, conflicts, meeting, problem] : cases) {
        const PreviewedScene scene = PlaceScene(File(sides, conflicts), kOurs, kTheirs);
        EXPECT_EQ(scene.meeting, meeting) << sides;
        EXPECT_EQ(scene.problem, problem) << sides;
        EXPECT_EQ(scene.verdict, scene.problem.empty() ? Verdict::Clean : Verdict::Conflicts) << sides;
    }
}

TEST(PlaceScene, NamesOfBothRenamesAreTold) {
    UnmergedFile file = File("fff", {"rename/rename"});
    file.pathInTheirs = "b\n.ovrin";
    EXPECT_EQ(PlaceScene(file, kOurs, kTheirs).problem,
              "main gave it this name, topic renamed it to b\\n.ovrin");
    EXPECT_FALSE(IsMerged(file));
}

TEST(PlaceScene, FilesOfBothSidesAreLookedInto) {
    for (const char* sides : {"fff", "-ff"}) EXPECT_TRUE(IsMerged(File(sides))) << sides;
    for (const char* sides : {"lff", "flf", "ffl", "f-f", "ff-", "f--", "-f-"})
        EXPECT_FALSE(IsMerged(File(sides))) << sides;
    EXPECT_GT(CostOf(File("fff")), CostOf(File("f-f")));
}

const std::string kHeader = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";

std::string Lantern(const std::string& layer) {
    return kHeader + "--- !o!1 &10\nGameObject:\n  m_Layer: " + layer + "\n  m_Name: Lantern\n";
}

PreviewedScene LookedInto(const ThreeTexts& texts) {
    ovrin_yaml::initialize();
    PreviewAnswer question;
    question.ours = kOurs;
    question.theirs = kTheirs;
    PreviewedScene scene;
    scene.path = "a.ovrin";
    LookInto(scene, texts, question, {}, ovrin_yaml::Threads::None);
    return scene;
}

TEST(LookInto, VerdictIsThatOfTheMerge) {
    EXPECT_EQ(LookedInto({Lantern("1"), Lantern("1"), Lantern("2")}).verdict, Verdict::Clean);
    const PreviewedScene scene = LookedInto({Lantern("1"), Lantern("5"), Lantern("2")});
    EXPECT_EQ(scene.verdict, Verdict::Conflicts);
    EXPECT_EQ(scene.conflicts.at(0).at("path"), "10.GameObject.m_Layer");
    EXPECT_NE(scene.report.find("    theirs  2    topic\n"), std::string::npos) << scene.report;
}

TEST(LookInto, WhatCantBeMergedIsUnknownAndTellsTheSide) {
    const std::pair<ThreeTexts, const char*> cases[] = {
        {{Lantern("1"), "text", Lantern("2")}, "a.ovrin of main"},
        {{Lantern("1"), Lantern("1"), std::string("a\0", 2)}, "a.ovrin of topic"},
        {{"text", Lantern("1"), Lantern("2")}, "a.ovrin of their common history"},
        {{Lantern("1"), "", Lantern("2")}, "a.ovrin of main"},
        {{Lantern("1"), Lantern("["), Lantern("2")}, "ours can't be read, at object 10"},
    };
    for (const auto& [texts, told] : cases) {
        const PreviewedScene scene = LookedInto(texts);
        EXPECT_EQ(scene.verdict, Verdict::Unknown) << told;
        EXPECT_NE(scene.problem.find(told), std::string::npos) << scene.problem;
    }
}

TEST(Sharing, EverySceneIsInOnePartWhateverTheCosts) {
    std::mt19937 random(12);
    for (int round = 0; round < 50; ++round) {
        PreviewQuestion question;
        for (std::size_t i = 0; i < random() % 20; ++i) {
            question.files.push_back(File("fff"));
            question.files.back().ours->size = random() % 3 ? random() % 100'000 : 0;
            question.answer.scenes.emplace_back().number = i + 1;
        }
        question.answer.count = question.answer.scenes.size();
        const std::size_t parts = 1 + random() % 5;
        std::vector<AnswerFile> files;
        for (std::size_t number = 1; number <= parts; ++number) {
            PreviewQuestion part = question;
            Reduce(part, {number, parts});
            EXPECT_EQ(part.files.size(), part.answer.scenes.size());
            files.push_back({std::to_string(number), part.answer});
        }
        EXPECT_EQ(Join(files).scenes.size(), question.answer.count); // each once, or it fails
    }
}

TEST(Sharing, NoPartHasMoreThanAPieceAboveAnother) {
    std::mt19937 random(13);
    for (int round = 0; round < 100; ++round) {
        std::vector<std::uint64_t> costs(1 + random() % 30);
        for (std::uint64_t& cost : costs) cost = random() % 1000;
        const std::vector<std::size_t> partOf = ShareOut(costs, 4);
        std::vector<std::uint64_t> loads(4);
        for (std::size_t i = 0; i < costs.size(); ++i) loads.at(partOf[i]) += costs[i];
        const auto [least, most] = std::ranges::minmax(loads);
        EXPECT_LE(most - least, std::ranges::max(costs));
        EXPECT_EQ(ShareOut(costs, 4), partOf);
    }
}

TEST(Words, AreCounted) {
    EXPECT_EQ(Counted(0, "scene"), "0 scenes");
    EXPECT_EQ(Counted(1, "scene"), "1 scene");
    PreviewAnswer answer;
    EXPECT_EQ(ByLinesWords(answer), "");
    EXPECT_EQ(ToText(answer), "0 scenes changed on both sides, none would conflict\n");
    answer.scenes.resize(8);
    for (PreviewedScene& scene : answer.scenes) scene.verdict = Verdict::Conflicts;
    EXPECT_TRUE(SummaryLine(answer).ends_with(", , , ,  and 3 more")) << SummaryLine(answer);
    answer.part = {2, 4};
    answer.count = 30;
    EXPECT_TRUE(SummaryLine(answer).starts_with("Part 2 of 4: 8 of 30 scenes changed"))
        << SummaryLine(answer);
}

} // namespace
