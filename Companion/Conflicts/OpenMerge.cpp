#include "Conflicts/OpenMerge.h"

#include "Words/Failure.h"

namespace ovrin {

namespace {

constexpr const char* kSideNames[] = {"base", "ours", "theirs"};

} // namespace

const char* SideName(Side side) {
    return kSideNames[static_cast<std::size_t>(side)];
}

Side SideNamed(std::string_view name) {
    for (const Side side : {Side::Base, Side::Ours, Side::Theirs})
        if (name == SideName(side)) return side;
    throw Failure("There is no side \"" + std::string(name) + "\": it is base, ours or theirs");
}

} // namespace ovrin
