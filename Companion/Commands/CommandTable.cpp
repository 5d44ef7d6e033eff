#include "Commands/CommandTable.h"

#include "Commands/MergeCommand.h"

namespace ovrin {

namespace {

constexpr Command kCommands[] = {
    {"merge", "merge a scene, as version control has it done", DescribeMerge},
};

} // namespace

std::span<const Command> Commands() {
    return kCommands;
}

} // namespace ovrin
