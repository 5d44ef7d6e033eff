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
    StyledLine what; ///< what the side did, where it has no value or one that fills pages; else empty
    std::vector<StyledLine> lines;
    std::size_t firstDifference = 0; ///< line
};

/// The values of base, ours and theirs, in this order, in lines of so many columns. What ours and theirs have
/// and the base hasn't is marked, and in the base what one of them lacks; where there is no base they are
/// held against each other.
std::array<SideText, 3> SideTextsOf(const Walk& walk, const Walk::Stop& stop, const Letters& letters,
                                    std::size_t columns);

/// A scene without conflicts in the same way: of ours and theirs the objects that the other one lacks.
std::array<SideText, 3> AddedObjectsOf(const Walk& walk, const Walk::Stop& stop, const Letters& letters,
                                       std::size_t columns);

} // namespace ovrin
