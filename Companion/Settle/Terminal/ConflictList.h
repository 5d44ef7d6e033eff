#pragma once

#include "Settle/Terminal/Letters.h"
#include "Settle/Terminal/StyledText.h"
#include "Settle/Terminal/Walk.h"

#include <cstddef>
#include <vector>

namespace ovrin {

/// A part of a screen, in characters.
struct Extent {
    std::size_t columns = 0, rows = 0;
};

/// The list of all that is to be settled, grouped by scene and object, where the one at which a person stands
/// is in sight:
///
///     Harbour/Pier/Lantern
///     • m_Layer
///       m_Name              theirs
///
/// Puts into words only what is in sight. `top` is the first row of the list that is shown; it changes where
/// it must.
std::vector<StyledLine> ConflictListLines(const Walk& walk, const Letters& letters, Extent extent,
                                          std::size_t& top);

} // namespace ovrin
