#pragma once

#include "Commands/Outcome.h"
#include "Settle/SettleScenes.h"
#include "Settle/Web/PageServer.h"

namespace ovrin {

/// Lets the user settle scenes, which are open, on a page in the browser. `remarks` is what opening them came
/// to. Throws Failure.
Outcome SettleInBrowser(SettleScenes& scenes, const PageOptions& options, const Remarks& remarks);

} // namespace ovrin
