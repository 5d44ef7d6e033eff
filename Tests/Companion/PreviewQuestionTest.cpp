#include "Preview/Question.h"

#include "Preview/LookIntoAll.h"
#include "Scenes/SceneRules.h"

#include "ErrorOf.h"
#include "Support/GitFolder.h"
#include "Words/Failure.h"

#include <filesystem>

namespace {

using namespace ovrin;
using failures::ErrorOf;

std::string Scene(const std::string& layer, const std::string& more = "") {
    return "%YAML 1.1\n%TAG !o! tag:test,2011:\n--- !o!1 &10\nGameObject:\n  m_Layer: " + layer + more + "\n";
}

/// Scenes that both branches changed; "topic" is to be merged into "main".
struct PreviewQuestionTest : GitFolder {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }

    void Branch(const std::map<std::string, std::string>& base,
                const std::map<std::string, std::string>& theirs,
                const std::map<std::string, std::string>& ours) const {
        const std::string start = Commit(base);
        CommitOn("topic", start, theirs);
        Git({"checkout", "-q", "main"});
        Commit(ours);
    }
    /// A line for each scene: its number, path and verdict.
    static std::string Verdicts(const PreviewQuestion& question) {
        static constexpr const char* kVerdicts[] = {"clean", "conflicts", "unknown"};
        std::string text;
        for (const PreviewedScene& scene : question.answer.scenes)
            text += std::to_string(scene.number) + " " + scene.path + " " +
                    kVerdicts[static_cast<std::size_t>(scene.verdict)] + "\n";
        return text;
    }
    std::string Looked(PreviewQuestion& question) const {
        std::size_t told = 0;
        LookIntoAll(question, Found(), SceneRules(), [&](std::size_t done, std::size_t) { told = done; });
        EXPECT_LE(told, question.files.size());
        return Verdicts(question);
    }
};

const std::string kOdd = "odd \xff\n\"$x\".ovrin";

TEST_F(PreviewQuestionTest, EverySceneHasItsVerdictWhateverItsNameAndBytes) {
    const std::string more = "\n  m_Name: A\n  m_Tag: 1\n  m_Flags: 0";
    Branch({{"a.ovrin", Scene("1", more)},
            {kOdd, Scene("1")},
            {"c.ovrin", Scene("1")},
            {"d.ovrin", Scene("1")},
            {"words", "1\n"}},
           {{"a.ovrin", Scene("2", more)},
            {kOdd, Scene("2")},
            {"c.ovrin", "\xff 2\n"},
            {"d.ovrin", Scene("2")},
            {"e.ovrin", Scene("2")},
            {"words", "2\n"}},
           {{"a.ovrin", Scene("1", more + "\n  m_New: 1")},
            {kOdd, Scene("3")},
            {"c.ovrin", Scene("3")},
            {"e.ovrin", ""},
            {"words", "3\n"}});
    PreviewQuestion question = AskFor(Found(), "topic");
    EXPECT_EQ(Looked(question),
              "1 a.ovrin clean\n2 c.ovrin unknown\n3 e.ovrin unknown\n4 " + kOdd + " conflicts\n");
    EXPECT_EQ(question.answer.scenes[3].conflicts[0]["path"], "10.GameObject.m_Layer");
    std::string parts;
    for (const std::size_t part : {1, 2, 3}) {
        PreviewQuestion some = AskFor(Found(), "topic");
        Reduce(some, {part, 3});
        EXPECT_EQ(some.files.size(), some.answer.scenes.size());
        EXPECT_EQ(some.answer.count, 4u);
        parts += Looked(some);
    }
    EXPECT_EQ(std::ranges::count(parts, '\n'), 5); // a break stands in a name
}

TEST_F(PreviewQuestionTest, HashIsThatOfWhatDecidesTheAnswer) {
    Branch({{"a.ovrin", Scene("1")}}, {{"a.ovrin", Scene("2")}}, {{"a.ovrin", Scene("3")}, {"below/x", ""}});
    const std::string first = AskFor(Found(), "topic").answer.question;
    {
        const surroundings::Here below("below");
        EXPECT_EQ(AskFor(Found(), "refs/heads/topic").answer.question, first);
    }
    Git({"config", "core.attributesFile", "attributes"});
    folder.Write("attributes", "*.ovrin merge=ovrin\n");
    EXPECT_NE(AskFor(Found(), "topic").answer.question, first);
    Commit({});
    folder.Write("attributes", "");
    EXPECT_NE(AskFor(Found(), "topic").answer.question, first);
}

TEST_F(PreviewQuestionTest, MissingTextIsTheEndOfNoOtherScene) {
    Branch({{"a.ovrin", Scene("1")}, {"b.ovrin", Scene("4")}},
           {{"a.ovrin", Scene("2")}, {"b.ovrin", Scene("5")}},
           {{"a.ovrin", Scene("3")}, {"b.ovrin", Scene("6")}});
    PreviewQuestion question = AskFor(Found(), "topic");
    const std::string blob = Git({"rev-parse", "topic:a.ovrin"});
    std::filesystem::remove(".git/objects/" + blob.substr(0, 2) + "/" + blob.substr(2));
    EXPECT_EQ(Looked(question), "1 a.ovrin unknown\n2 b.ovrin conflicts\n");
    EXPECT_NE(question.answer.scenes[0].problem.find(blob), std::string::npos)
        << question.answer.scenes[0].problem;
}

TEST_F(PreviewQuestionTest, WhatCannotBeMergedIsToldWithAWayOn) {
    EXPECT_EQ(ErrorOf<Failure>([&] { AskFor(Found(), "main"); }), "There is no commit here yet on main");
    const std::string start = Commit({{"a.ovrin", Scene("1")}});
    Git({"update-ref", "refs/remotes/origin/topic", start});
    EXPECT_TRUE(AskFor(Found(), "origin/topic").isMergedAlready);
    EXPECT_EQ(ErrorOf<Failure>([&] { AskFor(Found(), "topic"); }),
              "There is no revision \"topic\" here\nDid you mean origin/topic?");
    Git({"checkout", "-q", "--orphan", "other"});
    Commit({{"a.ovrin", Scene("2")}});
    EXPECT_EQ(ErrorOf<Failure>([&] { AskFor(Found(), "main"); }),
              "other and main have no common history: git refuses to merge them");
}

} // namespace
