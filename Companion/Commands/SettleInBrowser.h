#pragma once

#include "Commands/Outcome.h"
#include "Settle/SettleScenes.h"
#include "Settle/Web/PageServer.h"

namespace ovrin {

/// Lets the user settle scenes, which are open, on a page in the browser. Throws Failure.
Outcome SettleInBrowser(SettleScenes& scenes, const PageOptions& options);

} // namespace ovrin
