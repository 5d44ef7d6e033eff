#include "Systems/Process.h"

#include "Descriptor.h"
#include "Words/Failure.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin;

TEST(Process, TalksWithMoreThanAPipeHolds) {
    OutliveFailedWrites();
    const std::string text(std::size_t{1} << 20, 'x');
    EXPECT_EQ(OutputOf({"cat"}, {.input = text}), text);
    EXPECT_EQ(OutputOf({"true"}, {.input = text}), "");
}

TEST(Process, TellsHowItEnded) {
    const ProcessResult result = RunProcess({"sh", "-c", "pwd; echo $WORD >&2; kill -9 $$"},
                                            {.folder = "/", .environment = {{"WORD", "told"}}});
    EXPECT_EQ(result.status, 128 + 9);
    EXPECT_EQ(result.output + result.errors, "/\ntold\n");
    EXPECT_THROW(OutputOf({"false"}), Failure);
    EXPECT_THROW(RunProcess({"/nowhere/program"}), Failure);
    EXPECT_THROW(RunProcess({"true"}, {.folder = "/nowhere"}), Failure);
}

} // namespace
