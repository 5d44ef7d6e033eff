#include "Commands/CommandTable.h"

#include "Commands/CheckCommand.h"
#include "Commands/SetupCommand.h"

namespace ovrin {

namespace {

constexpr Command kCommands[] = {
    {"check", "tell what is wrong with scenes", DescribeCheck},
    {"setup", "let git, Mercurial and Subversion merge scenes with this program", DescribeSetup},
};

} // namespace

std::span<const Command> Commands() {
    return kCommands;
}

} // namespace ovrin
