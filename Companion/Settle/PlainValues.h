#pragma once

#include "Conflicts/SceneMerge.h"
#include "Names/RecordPlace.h"

namespace ovrin {

/// Whether a decision about a conflict concerns this value alone: it settles no other conflict and brings
/// none, whichever side is taken, so that nobody needs to merge to know what follows. So it is for one text
/// in three versions, as long as it isn't a part of a reference, which the repair of a merged scene goes by.
bool IsPlainValue(const OpenConflict& conflict, const RecordPlaces& places);

} // namespace ovrin
