#include "Commands/CommandTable.h"

#include "Commands/DoctorCommand.h"
#include "Commands/MergeCommand.h"
#include "Commands/SetupCommand.h"

namespace ovrin {

namespace {

constexpr Command kCommands[] = {
    {"merge", "merge a scene, as version control has it done", DescribeMerge},
    {"setup", "let git, Mercurial and Subversion merge scenes with this program", DescribeSetup},
    {"doctor", "tell what keeps version control from merging scenes, and the cure", DescribeDoctor},
};

} // namespace

std::span<const Command> Commands() {
    return kCommands;
}

} // namespace ovrin
