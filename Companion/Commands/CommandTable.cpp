#include "Commands/CommandTable.h"

#include "Commands/CheckCommand.h"
#include "Commands/DiffCommand.h"
#include "Commands/DoctorCommand.h"
#include "Commands/MergeCommand.h"
#include "Commands/PreviewCommand.h"
#include "Commands/ReviewCommand.h"
#include "Commands/SettleCommand.h"
#include "Commands/SetupCommand.h"
#include "Commands/StatusCommand.h"

namespace ovrin {

namespace {

constexpr Command kCommands[] = {
    {"merge", "merge a scene, as version control has it done", DescribeMerge},
    {"status", "tell which scenes have open conflicts", DescribeStatus},
    {"settle", "settle the open conflicts of scenes", DescribeSettle},
    {"check", "tell what is wrong in scenes", DescribeCheck},
    {"preview", "tell which scenes would conflict if a branch were merged", DescribePreview},
    {"diff", "tell what changed in scenes, by the names of objects", DescribeDiff},
    {"review", "show what changed in scenes, or a merge of them, in a browser", DescribeReview},
    {"setup", "let git, Mercurial and Subversion merge scenes with this program", DescribeSetup},
    {"doctor", "tell what keeps version control from merging scenes, and the cure", DescribeDoctor},
};

} // namespace

std::span<const Command> Commands() {
    return kCommands;
}

} // namespace ovrin
