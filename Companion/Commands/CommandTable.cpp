#include "Commands/CommandTable.h"

#include "Commands/PreviewCommand.h"
#include "Commands/SetupCommand.h"

namespace ovrin {

namespace {

constexpr Command kCommands[] = {
    {"preview", "tell which scenes would conflict if a branch were merged", DescribePreview},
    {"setup", "let git, Mercurial and Subversion merge scenes with this program", DescribeSetup},
};

} // namespace

std::span<const Command> Commands() {
    return kCommands;
}

} // namespace ovrin
