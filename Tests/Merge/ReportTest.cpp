#include "Merge/ConflictReport.h"
#include "Merge/PathRanks.h"
#include "Support/Merges.h"

#include <random>
#include <sstream>
#include <stdexcept>

namespace {

using namespace merges;

class Report : public RulesTest {};

TEST_F(Report, ConflictsStandByPathWithBothSides) {
    EXPECT_EQ(
        Merge({"9: {x: '1,'}\n10: {x: '1,'}", "9: {x: '2,'}\n10: {x: '2,'}", "9: {x: '3,'}\n10: {x: '3,'}"})
            .report,
        "Conflicts:\n"
        "Left  10 \n    x change to 2,\n    ...\n"
        "Right 10 \n    x change to 3,\n    ...\n"
        "Left  9 \n    x change to 2,\n    ...\n"
        "Right 9 \n    x change to 3,\n    ...\n"
        "Conflict handling:\nNon-conflicts:\n");
    EXPECT_EQ(Merge({"a: 1", "{}", "a: '{'"}).report,
              "Conflicts:\nLeft  a delete\nRight a change to '{'\nConflict handling:\nNon-conflicts:\n");
    EXPECT_EQ(Merge({"{}", "{}", "{}"}).report, "Conflicts:\nConflict handling:\nNon-conflicts:\n");
}

TEST_F(Report, DecisionsAreWrittenBackAsTheyWereRead) {
    const std::string decisions = "LEFT a.b\nbase   z.*   why not\n# no line\n\nrIGHT a..b.\n";
    const MergeOutput output = Merge({"a: 1", "a: 2", "a: 3", ResolveBase, decisions});
    EXPECT_NE(output.report.find("Conflict handling:\nLeft a.b\nBase z.*\nRight a..b.\nNon-conflicts:\n"),
              std::string::npos)
        << output.report;
}

TEST_F(Report, WhatWasNoConflictIsDescribed) {
    const MergeOutput output =
        Merge({"a: 1\nb: 1\nc: 1\nd: 1\ne: [1]\nf: 1\ng: 1", "a: '['\nb: 1\nd: 1\ne: [1, '{']\ng: 1\nh: '{'",
               "a: '['\nb: '['\nc: 1\ne: [1]\ng: '{'\nh: '{'", ResolveBase, "right f\nbase g"});
    EXPECT_EQ(output.report.substr(output.report.find("Non")),
              "Non-conflicts:\n"
              "Both adds _.5 content\n"
              "Left adds _.6 add as h\n                     ...\n"
              "Right changes b change to '['\n"
              "Left removes c \n"
              "Right removes d \n"
              "Left changes e [1]\n  index 1 add as '{'\n"
              "Both removes f content\n"
              "Right changes g change to '{'\n"
              "Both adds h content\n")
        << output.records;
    EXPECT_NE(Merge({"a: 1", "{}", "a: 2", ResolveBase, "left a"})
                  .report.find("<unknown conflict type> a content\n"),
              std::string::npos);
}

TEST_F(Report, ACycleIsOneLineThatEndsInABlank) {
    RecordingConflictResolver resolver(TheRules(), ResolveBase);
    resolver.OnTransformCycleDetected(YAMLScalar::Lookup("12"), *Doc("Transform: {m_Father: {fileID: 13}}"));
    std::ostringstream stream;
    OutputConflictRecords(stream, resolver, false);
    EXPECT_EQ(stream.str(), "Conflicts:\nBreakCycle  12.Transform.m_Father.fileID \nConflict handling:\n");
}

/// The decisions in a file, as a report writes them, or what is thrown.
std::string Decisions(const std::string& file) {
    RecordingConflictResolver resolver(TheRules(), ResolveBase);
    resolver.SetResolveMethodForPaths({{PathOf("old"), ResolveLeft}});
    std::istringstream in(file);
    std::ostringstream out;
    try {
        resolver.SetResolveMethodForPaths(ReadDecisions(in));
    } catch (const std::runtime_error& error) {
        EXPECT_EQ(resolver.Resolves().size(), 1u) << "the old ones stay";
        return error.what();
    }
    OutputConflictRecords(out, resolver, false);
    return out.str().substr(std::string("Conflicts:\nConflict handling:\n").size());
}

TEST_F(Report, OnlyTheHandlingSectionIsRead) {
    const std::string handling = "Conflict handling:\n";
    const std::pair<std::string, const char*> cases[] = {
        {"", ""},
        {"right a.b", ""},
        {"Conflicts:\nLeft  a change to 1\nnonsense\n" + handling + "right a\n", "Right a\n"},
        {handling + "left a\nConflicts:\nleft b\n" + handling + "left c", "Left a\nLeft c\n"},
        {handling + "left a\nNon-conflicts:\n" + handling + "left b", "Left a\n"},
        {"Conflict handling: of all\nleft a", "Left a\n"},
        {handling + "#left a\n> left b\n>x y\nleft *.T.x", "Left *.T.x\n"},
        {handling + "left a.b\r\n", "Left a.b\r\n"}};
    for (const auto& [file, decisions] : cases) EXPECT_EQ(Decisions(file), decisions) << file;
}

TEST_F(Report, ALineThatSaysNothingFailsAsLineOne) {
    const auto unknown = [](const std::string& word) {
        return "Unknown handling type '" + word + "' (should be left,right or base) specified on line 1";
    };
    const std::string noWord = "No handling type (left,right,base) specified on line 1";
    const std::pair<std::string, std::string> cases[] = {{"left", noWord},
                                                         {">", noWord},
                                                         {"\r", noWord},
                                                         {"left\ta", noWord},
                                                         {"left ", "No property path specified on line 1"},
                                                         {"base   ", "No property path specified on line 1"},
                                                         {"left a\nkeep a.b", unknown("keep")},
                                                         {" left a", unknown("")},
                                                         {"BreakCycle a", unknown("breakcycle")},
                                                         {"breakCycle a", unknown("breakcycle")},
                                                         {"KEEP", noWord}};
    for (const auto& [line, error] : cases)
        EXPECT_EQ(Decisions("Conflict handling:\n" + line), error) << line;
}

TEST_F(Report, PathsAreRankedElementByElementAsBytes) {
    static const char* const kElements[] = {"", "1", "10", "9", "a", "a-b", "\xC3\xA9"};
    std::mt19937 random(1);
    PathRanks tree;
    std::vector<std::pair<std::vector<std::string>, std::uint32_t>> paths;
    WalkedPath walked;
    for (int step = 0; step < 5000; ++step) {
        if (random() % 2 && !walked.Elements().empty()) walked.Pop();
        if (walked.Elements().size() < 6) walked.Push(YAMLScalar::Lookup(kElements[random() % 7]));
        if (random() % 50 == 0) walked = random() % 2 ? WalkedPath() : WalkedPath(walked.Elements());
        std::vector<std::string> texts;
        for (const YAMLScalar* element : walked.Elements()) texts.emplace_back(element->Value());
        ASSERT_EQ(walked.Keep().Elements(), walked.Elements());
        paths.emplace_back(texts, tree.Add(walked.Keep()));
    }
    const std::vector<std::uint32_t> ranks = tree.Ranks();
    for (int i = 0; i < 100000; ++i) {
        const auto &a = paths[random() % paths.size()], &b = paths[random() % paths.size()];
        ASSERT_EQ(ranks[a.second] < ranks[b.second], a.first < b.first);
    }
}

TEST_F(Report, PathsAreCutAtEveryDot) {
    const std::pair<const char*, std::size_t> cases[] = {
        {"", 0}, {"a", 1}, {"a..b", 3}, {".a", 2}, {"a.", 2}};
    for (const auto& [text, elements] : cases) {
        EXPECT_EQ(StringToPath(text).size(), elements) << text;
        EXPECT_EQ(PathToString(StringToPath(text)), text);
    }
    EXPECT_EQ(StringToPath("*.x")[0], YAMLScalar::star);
}

} // namespace
