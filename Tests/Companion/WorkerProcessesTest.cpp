#include "Systems/WorkerProcesses.h"

#include <csignal>
#include <gtest/gtest.h>
#include <map>
#include <random>
#include <stdexcept>
#include <unistd.h>
#include <vector>

namespace {

using namespace ovrin;

std::map<std::size_t, WorkerAnswer> Answers(const std::vector<std::uint64_t>& sizes, const WorkLimits& limits,
                                            const std::function<std::string(std::size_t)>& work) {
    std::map<std::size_t, WorkerAnswer> answers;
    WorkInProcesses(sizes, limits, work, [&](std::size_t index, WorkerAnswer answer) {
        EXPECT_TRUE(answers.emplace(index, std::move(answer)).second);
    });
    return answers;
}

TEST(WorkerProcesses, GiveEveryAnswerWhole) {
    const auto answers = Answers(std::vector<std::uint64_t>(50, 1), {4, 10, 100},
                                 [](std::size_t index) { return std::string(index * 10'000, 'x'); });
    ASSERT_EQ(answers.size(), 50u);
    for (const auto& [index, answer] : answers) EXPECT_EQ(answer.text->size(), index * 10'000);
}

TEST(WorkerProcesses, ProcessTakesNoMoreThanItsShare) {
    const std::vector<std::uint64_t> sizes = {5, 5, 5, 5, 12, 1};
    std::map<std::string, std::uint64_t> done;
    for (const auto& [index, answer] :
         Answers(sizes, {2, 10, 10}, [](std::size_t) { return std::to_string(getpid()); }))
        done[*answer.text] += sizes[index];
    EXPECT_GE(done.size(), 4u);
    for (const auto& [process, size] : done) EXPECT_TRUE(size <= 10 || size == 12) << size;
}

TEST(WorkerProcesses, EndOfAProcessCostsOnePiece) {
    const auto answers = Answers(std::vector<std::uint64_t>(9, 1), {2, 100, 100}, [](std::size_t index) {
        if (index == 3) kill(getpid(), SIGKILL);
        if (index == 5) throw std::runtime_error("lost");
        return std::string("done");
    });
    ASSERT_EQ(answers.size(), 9u);
    EXPECT_EQ(answers.at(3).end, "killed by signal 9");
    EXPECT_EQ(answers.at(5).end, "ended with status 1");
    for (const std::size_t index : {0, 1, 2, 4, 6, 7, 8}) EXPECT_EQ(answers.at(index).text, "done");
}

/// Whatever the sizes and limits, and whatever pieces end their process.
TEST(WorkerProcesses, EveryPieceIsAnsweredOnceForItself) {
    std::mt19937 random(7);
    for (int round = 0; round < 40; ++round) {
        std::vector<std::uint64_t> sizes(random() % 12);
        for (std::uint64_t& size : sizes) size = random() % 20;
        const WorkLimits limits = {1 + random() % 4, random() % 30, random() % 40};
        const std::size_t fatal = random() % 15;
        const auto answers = Answers(sizes, limits, [&](std::size_t index) {
            if (index == fatal) _exit(3);
            return "piece " + std::to_string(index);
        });
        ASSERT_EQ(answers.size(), sizes.size()) << round;
        for (const auto& [index, answer] : answers)
            EXPECT_EQ(answer.text.value_or(answer.end),
                      index == fatal ? "ended with status 3" : "piece " + std::to_string(index));
    }
}

TEST(WorkerProcesses, LargestPieceComesFirst) {
    const std::vector<std::uint64_t> sizes = {2, 9, 4, 9, 1};
    std::vector<std::size_t> order;
    WorkInProcesses(
        sizes, {1, 100, 100}, [](std::size_t) { return std::string(); },
        [&](std::size_t index, const WorkerAnswer&) { order.push_back(index); });
    EXPECT_EQ(order, (std::vector<std::size_t>{1, 3, 2, 0, 4}));
}

TEST(WorkerProcesses, NoneIsStartedForNothing) {
    EXPECT_TRUE(Answers({}, {0, 0, 0}, [](std::size_t) { return std::string(); }).empty());
}

TEST(WorkerProcesses, ChangeNothingHere) {
    int changed = 0;
    Answers({1, 1}, {2, 10, 10}, [&](std::size_t) { return std::to_string(++changed); });
    EXPECT_EQ(changed, 0);
}

TEST(WorkerProcesses, AreGoneAfterAFailure) {
    const std::vector<std::uint64_t> sizes(4, 1);
    EXPECT_THROW(WorkInProcesses(
                     sizes, {4, 1, 4},
                     [](std::size_t index) {
                         if (index) sleep(60);
                         return std::string();
                     },
                     [](std::size_t, const WorkerAnswer&) { throw std::runtime_error("full"); }),
                 std::runtime_error);
}

} // namespace
