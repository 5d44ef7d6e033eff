#pragma once

#include "Settle/Wanted.h"

namespace ovrin {

/// Scenes that are settled together have one row of steps: what is done between two calls of BeginStep is one
/// of them, in whichever sessions, and taken back as one. The row is written down with the decisions, so that
/// it goes on where it was left; steps that were taken back are forgotten then.
void BeginStep(Sessions sessions);
/// Takes the last step back. False if there is none.
bool UndoStep(Sessions sessions);
/// Makes the step again that was taken back last. False if there is none, or another was made since.
bool RedoStep(Sessions sessions);

} // namespace ovrin
