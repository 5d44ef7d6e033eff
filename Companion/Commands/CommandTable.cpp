#include "Commands/CommandTable.h"

#include "Commands/SetupCommand.h"

namespace ovrin {

namespace {

constexpr Command kCommands[] = {
    {"setup", "let git, Mercurial and Subversion merge scenes with this program", DescribeSetup},
};

} // namespace

std::span<const Command> Commands() {
    return kCommands;
}

} // namespace ovrin
