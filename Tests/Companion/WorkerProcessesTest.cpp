#include "Systems/WorkerProcesses.h"

#include <csignal>
#include <gtest/gtest.h>
#include <map>
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
