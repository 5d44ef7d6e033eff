#include "Commands/CommandLine.h"
#include "Commands/Suggestion.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin;

TEST(CommandLine, NearestWordIsTheOneMeant) {
    const std::vector<std::string> known = {"--json", "--sarif", "--all", "--staged"};
    EXPECT_EQ(Nearest("--jsn", known), "--json");
    EXPECT_EQ(Nearest("--jsno", known), "--json");
    EXPECT_EQ(Nearest("--staging", known), "--staged");
    EXPECT_EQ(Nearest("--verbose", known), "");
}

TEST(CommandLine, MisuseFails) {
    EXPECT_EQ(RunCommandLine({"nothing-known"}), Outcome::Failed);
    EXPECT_EQ(RunCommandLine({}), Outcome::Failed);
}

} // namespace
