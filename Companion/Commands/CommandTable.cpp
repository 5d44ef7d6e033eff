#include "Commands/CommandTable.h"

#include "Commands/DoctorCommand.h"
#include "Commands/SetupCommand.h"

namespace ovrin {

namespace {

constexpr Command kCommands[] = {
    {"setup", "let git, Mercurial and Subversion merge scenes with this program", DescribeSetup},
    {"doctor", "tell what keeps version control from merging scenes, and the cure", DescribeDoctor},
};

} // namespace

std::span<const Command> Commands() {
    return kCommands;
}

} // namespace ovrin
