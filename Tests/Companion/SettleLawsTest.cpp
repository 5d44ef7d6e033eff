#include "Conflicts/DecisionPath.h"
#include "OpenScenes.h"
#include "SceneGenerator.h"
#include "Settle/SettleSession.h"
#include "Settle/Wanted.h"
#include "Support/Program.h"
#include "Words/Failure.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <random>

namespace {

using namespace open_scenes;

// More of them find no more.
constexpr unsigned kSeeds = 100;

/// Without some of its objects, as if somebody had removed them by hand.
std::string Thinned(const std::string& scene, std::mt19937& random) {
    std::string thinned;
    for (std::size_t begin = 0, end = 0; begin < scene.size(); begin = end) {
        end = std::min(scene.find("\n--- ", begin), scene.size() - 1) + 1;
        if (begin == 0 || random() % 6) thinned += scene.substr(begin, end - begin);
    }
    return thinned;
}

ThreeTexts GeneratedTexts(unsigned seed, bool isThinned) {
    std::ostringstream base, left, right;
    ovrin_bench::SceneOptions options;
    options.seed = seed + 1000;
    options.objects = 60;
    options.edited = 300000;
    options.conflicts = 8;
    GenerateScene(options, {base, left, right});
    std::mt19937 random(seed);
    if (!isThinned) return {base.str(), right.str(), left.str()};
    return {base.str(), Thinned(right.str(), random), Thinned(left.str(), random)};
}

/// How all conflicts stand, in words.
std::string StateOf(const SettleSession& session) {
    std::string state;
    for (const MetConflict& met : session.Conflicts())
        state += DecisionPath(met.conflict->path) + (met.isOpen ? " open" : " settled ") +
                 (met.decided ? SideName(*met.decided) : "") + "\n";
    for (const Problem& problem : session.Problems()) state += problem.text + "\n";
    return state;
}

bool HasProblem(const SettleSession& session, const std::string& text) {
    return std::ranges::count(session.Problems(), text, &Problem::text) > 0;
}

Side SideBy(std::mt19937& random) {
    return std::array{Side::Base, Side::Ours, Side::Theirs}[random() % 3];
}

struct SettleLaws : testing::TestWithParam<bool> {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }
};

TEST_P(SettleLaws, StepsWithoutAMergeEndWhereAMergeOfAllDecisionsDoes) {
    for (unsigned seed = 0; seed < kSeeds; ++seed) {
        const ThreeTexts texts = GeneratedTexts(seed, GetParam());
        const auto session = SessionOf(texts);
        std::mt19937 random(seed);
        for (int step = 0; step < 6; ++step) {
            const std::vector<MetConflict> conflicts = session->Conflicts();
            if (conflicts.empty()) break;
            const MetConflict& met = conflicts[random() % conflicts.size()];
            if (step == 3)
                session->TakeAll(SideBy(random), [&](const OpenConflict&) { return random() % 2 == 0; });
            else if (random() % 4)
                session->Decide({{DecisionPath(met.conflict->path), SideBy(random)}});
            else
                session->Undo();
            std::vector<DecisionStep> steps;
            if (!session->Decisions().empty()) steps = {{session->Decisions().size(), 1}};
            const auto merged = SessionOf(texts, {session->Decisions(), 0, steps});
            ASSERT_EQ(StateOf(*session), StateOf(*merged)) << "seed " << seed << " step " << step;
            ASSERT_EQ(session->Result(), merged->Result()) << "seed " << seed;
        }
    }
}

TEST_P(SettleLaws, EachRemedyMendsItsProblem) {
    std::size_t problems = 0, remedies = 0;
    for (unsigned seed = 0; seed < kSeeds; ++seed) {
        const auto session = SessionOf(GeneratedTexts(seed, GetParam()));
        std::mt19937 random(seed);
        for (const MetConflict& met : session->Conflicts())
            session->Decide({{DecisionPath(met.conflict->path), SideBy(random)}},
                            random() % 2 ? SettleSession::Follow::Yes : SettleSession::Follow::No);
        const std::vector<Problem> found = session->Problems();
        problems += found.size();
        for (const Problem& problem : found) {
            for (const Remedy& remedy : problem.remedies) {
                ++remedies;
                EXPECT_TRUE(session->Decide(remedy.decisions).empty())
                    << "seed " << seed << " " << remedy.text;
                EXPECT_FALSE(HasProblem(*session, problem.text))
                    << "seed " << seed << ": " << problem.text << " / " << remedy.text;
                session->Undo();
            }
        }
    }
    EXPECT_GE(problems, GetParam() ? 30 : 0);
    EXPECT_GE(remedies, problems);
}

TEST_P(SettleLaws, WhatOneSideDidAloneIsNoProblem) {
    for (unsigned seed = 0; seed < kSeeds; ++seed) {
        const ThreeTexts texts = GeneratedTexts(seed, GetParam());
        for (const ThreeTexts& alone :
             {ThreeTexts{texts.base, texts.base, texts.theirs},
              ThreeTexts{texts.base, texts.ours, texts.base}, ThreeTexts{texts.base, texts.ours, texts.ours}})
            try {
                EXPECT_EQ(StateOf(*SessionOf(alone)), "") << "seed " << seed;
            } catch (const Failure&) {
                EXPECT_TRUE(GetParam()) << "seed " << seed; // no scene can have parents that aren't there
            }
    }
}

// What a person does step by step, a script by paths and by a file, and the engine by that file.
TEST_P(SettleLaws, SameDecisionsGiveTheSameBytesToEverybody) {
    constexpr const char* kNames[] = {"Base", "Right", "Left"};
    const program::WorkingDirectory folder;
    for (unsigned seed = 0; seed < kSeeds / 10; ++seed) {
        const ThreeTexts texts = GeneratedTexts(seed, GetParam());
        const auto session = SessionOf(texts);
        std::mt19937 random(seed);
        for (const MetConflict& met : session->Conflicts())
            session->Decide({{DecisionPath(met.conflict->path), SideBy(random)}});
        session->TakeAll(Side::Theirs, [](const OpenConflict&) { return true; });
        std::string file;
        std::vector<Wanted> wanted;
        for (const Decision& decision : session->Decisions()) {
            file.insert(0, kNames[static_cast<std::size_t>(decision.side)] + (" " + decision.path + "\n"));
            wanted.push_back({decision.path, decision.side});
        }
        folder.Write("decisions", "Conflict handling:\n" + file);
        folder.Write("base", texts.base);
        folder.Write("left", texts.theirs);
        folder.Write("right", texts.ours);
        folder.Run("\"$OVRIN\" merge --force --fallback none -i decisions base left right result --rules " +
                   std::string(OVRIN_SOURCE_DIR "/Src/Data/mergerules.txt"));
        EXPECT_EQ(session->Result(), folder.Read("result")) << "seed " << seed;
        std::vector<std::unique_ptr<SettleSession>> scripts;
        scripts.push_back(SessionOf(texts));
        if (wanted.empty()) continue;
        DecideByFile(scripts, (folder.Path() / "decisions").string());
        EXPECT_EQ(scripts[0]->Result(), session->Result()) << "seed " << seed;
        scripts[0] = SessionOf(texts);
        DecideWanted(scripts, wanted);
        EXPECT_EQ(scripts[0]->Result(), session->Result()) << "seed " << seed;
    }
}

INSTANTIATE_TEST_SUITE_P(Scenes, SettleLaws, testing::Bool());

} // namespace
