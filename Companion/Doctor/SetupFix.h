#pragma once

#include "Setup/Configuration.h"

#include <functional>
#include <string>

namespace ovrin {

/// The fix of a problem that a set-up solves: it sets the system up, and tells that. It throws Failure where
/// the set-up leaves something undone.
std::function<std::string()> FixBySetup(const std::string& system, Scope scope);

} // namespace ovrin
