#pragma once

#include "Conflicts/OpenMerge.h"

#include <optional>

namespace ovrin {

struct Repository;

/// What the user wants to stand at open conflicts: OVRIN_TAKE of the environment, or else "ovrin.take" of the
/// configuration of git or Mercurial, or else ours. Asking for a configuration starts a process, and may be
/// done on any thread. Throws BadSetting for a value that is no side.
Side SideToTake(const std::optional<Repository>& repository);

} // namespace ovrin
