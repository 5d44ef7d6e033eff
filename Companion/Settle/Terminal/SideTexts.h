#pragma once

#include "Settle/Terminal/Letters.h"
#include "Settle/Terminal/StyledText.h"
#include "Settle/Terminal/Walk.h"

#include <array>
#include <cstddef>
#include <vector>

namespace ovrin {

/// What a side has at a conflict, in lines of a screen.
struct SideText {
    std::vector<StyledLine> lines;
    std::size_t firstDifference = 0; ///< line
};

/// The values of base, ours and theirs, in this order, in lines of so many columns. What ours and theirs have
/// and the base hasn't is marked, and in the base what one of them lacks; where there is no base they are
/// held against each other. Of an object as a whole first what the side did.
std::array<SideText, 3> SideTextsOf(const Walk& walk, const Walk::Stop& stop, const Letters& letters,
                                    std::size_t columns);

/// A scene that both sides added in the same way: "base" has nothing, ours and theirs the objects that the
/// other one lacks.
std::array<SideText, 3> AddedObjectsOf(const Walk& walk, const Walk::Stop& stop, const Letters& letters,
                                       std::size_t columns);

} // namespace ovrin
