#include "Commands/CommandTable.h"

#include "Commands/SettleCommand.h"
#include "Commands/StatusCommand.h"

namespace ovrin {

namespace {

constexpr Command kCommands[] = {
    {"status", "tell which scenes have open conflicts", DescribeStatus},
    {"settle", "settle the open conflicts of scenes", DescribeSettle},
};

} // namespace

std::span<const Command> Commands() {
    return kCommands;
}

} // namespace ovrin
