#include "Preview/AnswerMarkdown.h"
#include "Preview/AnswerText.h"
#include "Preview/Join.h"
#include "Preview/Sharing.h"
#include "Words/Failure.h"

#include <algorithm>
#include <gtest/gtest.h>

namespace {

using namespace ovrin;

PreviewedScene Scene(std::size_t number, Verdict verdict = Verdict::Conflicts) {
    PreviewedScene scene;
    scene.number = number;
    scene.path = "Scene " + std::to_string(number) + ".ovrin";
    scene.verdict = verdict;
    if (verdict == Verdict::Conflicts) scene.conflicts = {{{"path", "10.Light.x"}}};
    if (verdict == Verdict::Conflicts) scene.report = "Lantern (10)\n  x: both changed it\n";
    return scene;
}

PreviewAnswer Answer(std::size_t count) {
    PreviewAnswer answer;
    answer.ours = {"main", "1111"};
    answer.theirs = {"topic", "2222"};
    answer.question = "3333";
    answer.count = count;
    for (std::size_t i = 1; i <= count; ++i) answer.scenes.push_back(Scene(i));
    return answer;
}

/// The answer in as many parts, each through JSON, as files of the names "1", "2"...
std::vector<AnswerFile> Parts(const PreviewAnswer& whole, std::size_t parts) {
    std::vector<std::uint64_t> costs;
    for (const PreviewedScene& scene : whole.scenes) costs.push_back(scene.number * 7 % 5);
    const std::vector<std::size_t> partOf = ShareOut(costs, parts);
    std::vector<AnswerFile> files;
    for (std::size_t part = 0; part < parts; ++part) {
        PreviewAnswer answer = whole;
        answer.part = {part + 1, parts};
        std::erase_if(answer.scenes, [&](const auto& scene) { return partOf[scene.number - 1] != part; });
        files.push_back({std::to_string(part + 1), AnswerOfJson(ToJson(answer))});
    }
    return files;
}

std::string FailureOf(const std::vector<AnswerFile>& files) {
    try {
        Join(files);
    } catch (const Failure& failure) {
        return failure.what();
    }
    return {};
}

TEST(Sharing, EveryPieceGoesToOnePartAndPartsCostTheSame) {
    const std::vector<std::uint64_t> costs = {1, 9, 3, 3, 2, 9, 1, 8};
    const std::vector<std::size_t> partOf = ShareOut(costs, 3);
    std::vector<std::uint64_t> loads(3);
    for (std::size_t i = 0; i < costs.size(); ++i) loads.at(partOf[i]) += costs[i];
    EXPECT_EQ(loads, (std::vector<std::uint64_t>{12, 12, 12}));
    EXPECT_EQ(ShareOut(costs, 1), std::vector<std::size_t>(8));
    EXPECT_EQ(ShareOut({}, 3), std::vector<std::size_t>());
}

TEST(Sharing, PartIsANumberOfSoMany) {
    EXPECT_EQ(ParsePart("2/4").number, 2u);
    EXPECT_EQ(ParsePart("2/4").parts, 4u);
    for (const char* text : {"", "2", "0/4", "5/4", "2/", "/4", "2/4/6", "-1/4", "2/4x", "1/999999"})
        EXPECT_THROW(ParsePart(text), Failure) << text;
}

TEST(Joining, PartsMakeTheWholeInAnyOrder) {
    const PreviewAnswer whole = Answer(9);
    for (const std::size_t parts : {1, 3, 12}) {
        std::vector<AnswerFile> files = Parts(whole, parts);
        std::ranges::reverse(files);
        EXPECT_EQ(ToJson(Join(files)), ToJson(whole)) << parts;
    }
}

TEST(Joining, MissingAndRepeatedPartsAreTold) {
    std::vector<AnswerFile> files = Parts(Answer(9), 4);
    files.erase(files.begin() + 1);
    EXPECT_EQ(FailureOf(files), "Of 4 parts there is no 2");
    files.push_back(files.back());
    files.back().name = "again";
    EXPECT_EQ(FailureOf(files), "Part 4 is there more than once, the last time in again");
}

TEST(Joining, OtherQuestionsAreTold) {
    const auto joined = [](const auto& change) {
        std::vector<AnswerFile> files = Parts(Answer(3), 2);
        change(files[1].answer);
        return FailureOf(files);
    };
    EXPECT_NE(joined([](auto& answer) { answer.theirs.id = "4444"; }).find("topic (4444)"),
              std::string::npos);
    EXPECT_NE(joined([](auto& answer) { answer.part.parts = 3; }).find("in 3 parts"), std::string::npos);
    EXPECT_NE(joined([](auto& answer) { answer.question = "other"; }).find("saw other scenes"),
              std::string::npos);
    EXPECT_NE(joined([](auto& answer) { answer.scenes.clear(); }).find("don't make a whole"),
              std::string::npos);
}

TEST(Joining, WhatIsNoAnswerIsRefused) {
    const std::string sound = ToJson(Answer(1));
    for (const std::string& text : {std::string(), std::string("{}"), sound.substr(0, sound.size() / 2)})
        EXPECT_THROW(AnswerOfJson(text), Failure) << text;
    std::string newer = sound;
    newer.replace(newer.find("\"version\": 1"), 12, "\"version\": 9");
    EXPECT_THROW(AnswerOfJson(newer), Failure);
}

TEST(Summary, TellsWhatIsNotKnown) {
    PreviewAnswer answer = Answer(2);
    EXPECT_EQ(SummaryLine(answer),
              "2 scenes changed on both sides, 2 would conflict: Scene 1.ovrin, Scene 2.ovrin");
    answer.scenes = {Scene(1, Verdict::Clean), Scene(2, Verdict::Unknown)};
    EXPECT_EQ(SummaryLine(answer),
              "2 scenes changed on both sides, none would conflict; of 1 that can't be told: Scene 2.ovrin");
}

TEST(Markdown, HasRoomInACommentAndTellsTheRest) {
    PreviewAnswer answer = Answer(3000);
    for (PreviewedScene& scene : answer.scenes) scene.report = std::string(5000, 'x') + "\n";
    answer.scenes[0].report.clear();
    for (int i = 0; i < 5000; ++i) answer.scenes[0].report += "a line\n";
    const std::string text = ToMarkdown(answer);
    EXPECT_LE(text.size(), kMostMarkdown);
    EXPECT_NE(text.find("... and 3286 more lines"), std::string::npos);
    EXPECT_NE(text.find("more scenes\n"), std::string::npos);
}

TEST(Markdown, TakesNothingForMarkup) {
    PreviewAnswer answer = Answer(2);
    answer.theirs.name = "`x` @team";
    answer.scenes[0].path = "<b>*a*\n.ovrin";
    answer.scenes[0].report = "```\n<script>\n";
    answer.scenes[1].report.clear();
    answer.scenes[1].problem = "#1 ``";
    const std::string text = ToMarkdown(answer);
    for (const char* part : {"`` `x` @team ``", "<summary><code>&lt;b&gt;*a*\\n.ovrin</code>",
                             "````text\n```\n<script>\n````\n", "``` #1 ``; 1 conflict ```"})
        EXPECT_NE(text.find(part), std::string::npos) << part << "\nin\n" << text;
}

} // namespace
