#pragma once

#include "Settle/Terminal/KeyTable.h"
#include "Settle/Terminal/Walk.h"

namespace ovrin {

/// Whether a request decides something, or takes a decision back.
bool MakesStep(Request request);

/// Does what a request asks for that concerns the walk alone: going somewhere, and steps. What became of it
/// is said there. All others do nothing.
void CarryOut(Walk& walk, Request request, Key key);

} // namespace ovrin
