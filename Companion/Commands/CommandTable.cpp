#include "Commands/CommandTable.h"

#include "Commands/MergeCommand.h"
#include "Commands/SetupCommand.h"

namespace ovrin {

namespace {

constexpr Command kCommands[] = {
    {"merge", "merge a scene, as version control has it done", DescribeMerge},
    {"setup", "let git, Mercurial and Subversion merge scenes with this program", DescribeSetup},
};

} // namespace

std::span<const Command> Commands() {
    return kCommands;
}

} // namespace ovrin
