#pragma once

#include "Doctor/Diagnosis.h"

#include <string>
#include <vector>

namespace ovrin {

/// A check and what it found.
struct Examined {
    const char* code; ///< stable, for scripts: "git-driver"
    Diagnosis diagnosis;
};

/// Looks at everything, in a fixed order. With `fix` what can be put right safely is, and then looked at once
/// more.
std::vector<Examined> Examine(bool fix);

/// The stable word for a state: "ok", "note", "problem", "fixed", "skipped", "unknown".
const char* HealthName(Health health);

} // namespace ovrin
